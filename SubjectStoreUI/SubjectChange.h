#pragma once

#include "StoreInterface/IStoreReader.h"
#include "SubjectStoreUI/SubjectsModelRole.h"

#include <algorithm>
#include <cstddef>

namespace SubjectStoreUI
{

/// The change stamps that a model has seen: the greatest of each aspect.
class SeenStamps
{
public:
  [[nodiscard]] bool Newer(const NMX::ChangeStamps& stamps, NMX::EAspect aspect) const
  {
    return stamps[static_cast<std::size_t>(aspect)] > m_stamps[static_cast<std::size_t>(aspect)];
  }

  void Fold(const NMX::ChangeStamps& stamps)
  {
    for (std::size_t aspect = 0; aspect < m_stamps.size(); ++aspect)
      m_stamps[aspect] = std::max(m_stamps[aspect], stamps[aspect]);
  }

  [[nodiscard]] std::uint64_t Of(NMX::EAspect aspect) const { return m_stamps[static_cast<std::size_t>(aspect)]; }

private:
  NMX::ChangeStamps m_stamps{};
};

/// Which aspects of a subject have changed since the model looked last.
struct ChangedAspects
{
  bool parameters = false;
  bool warnings = false;
  bool devices = false;
  bool markers = false;

  ChangedAspects() = default;
  ChangedAspects(const NMX::ChangeStamps& stamps, const SeenStamps& seen)
      : parameters(seen.Newer(stamps, NMX::EAspect::Parameters)), warnings(seen.Newer(stamps, NMX::EAspect::Warnings)),
        devices(seen.Newer(stamps, NMX::EAspect::SmartClusters)), markers(seen.Newer(stamps, NMX::EAspect::Markers))
  {
  }

  [[nodiscard]] bool Any() const { return parameters || warnings || devices || markers; }

  /// The roles that may have changed.
  [[nodiscard]] QList<int> Roles() const
  {
    if (parameters)
      return SubjectsModelRole::All();
    QList<int> roles;
    if (warnings)
      roles << SubjectsModelRole::SubjectWarnings;
    if (devices)
      roles << SubjectsModelRole::SubjectSmartClusterDeviceNames << SubjectsModelRole::SubjectPatterns;
    if (markers)
      roles << SubjectsModelRole::SubjectSmartAndBasicMarkers;
    return roles;
  }
};

}
