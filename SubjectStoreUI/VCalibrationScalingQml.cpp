#include "SubjectStoreUI/VCalibrationScalingQml.h"

#include "StoreInterface/EntryPaths.h"
#include "SubjectStoreUI/PanelBackend.h"

#include <cmath>
#include <utility>

namespace SubjectStoreUI
{

using NMX::EResult;
using NMX::IResult;
using Positions = std::vector<NMX::Position>;

std::unique_ptr<VCalibrationScalingQml> VCalibrationScalingQml::Make(const PanelBackend& backend,
                                                                     NMX::TSubjectStoreId object)
{
  auto markers = backend.Entry<Positions>(object, NMX::Paths::Markers()).value_or(Positions{});
  if (markers.size() < 2)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Warning, "Subject [%1%] has no markers between which to measure.",
             object);
    return nullptr;
  }
  return std::unique_ptr<VCalibrationScalingQml>(new VCalibrationScalingQml(backend, object, std::move(markers)));
}

VCalibrationScalingQml::VCalibrationScalingQml(const PanelBackend& backend, NMX::TSubjectStoreId object,
                                               Positions markers)
    : m_backend(backend), m_object(object), m_markers(std::move(markers))
{
  connect(&m_measurements, &VCalibrationObjectMeasurementModel::ScaleFactorChanged, this,
          &VCalibrationScalingQml::scaleFactorChanged);
}

VCalibrationScalingQml::~VCalibrationScalingQml() = default;

QStringList VCalibrationScalingQml::markerNames() const
{
  QStringList names;
  for (std::size_t marker = 1; marker <= m_markers.size(); ++marker)
    names.append(tr("Marker %1").arg(marker));
  return names;
}

VResultGadget VCalibrationScalingQml::add(int first, int second)
{
  const auto a = static_cast<std::size_t>(first); // of a negative position far past the end
  const auto b = static_cast<std::size_t>(second);
  if (a == b || a >= m_markers.size() || b >= m_markers.size())
    return {EResult::InvalidArgument, "Two different markers have to be chosen."};
  const double distance =
      std::hypot(m_markers[a].x - m_markers[b].x, m_markers[a].y - m_markers[b].y, m_markers[a].z - m_markers[b].z);
  m_measurements.addMeasurement(tr("Marker %1 to marker %2").arg(first + 1).arg(second + 1), distance);
  return IResult(EResult::Ok);
}

bool VCalibrationScalingQml::remove(int row)
{
  return m_measurements.removeRows(row, 1);
}

VResultGadget VCalibrationScalingQml::apply()
{
  const double factor = m_measurements.scaleFactor();
  if (!(factor > 0) || !std::isfinite(factor))
    return {EResult::InvalidValue, "The measured distances have to be above 0."};
  const VResultGadget scaled = m_backend.Edit(
      [&](NMX::IEntryEditor& editor) -> IResult
      {
        Positions markers;
        if (const IResult read = NMX::Read(editor, m_object, NMX::Paths::Markers(), markers); read.Failed())
          return read;
        if (markers != m_markers)
          return EResult::Conflict;
        for (NMX::Position& marker : markers)
          marker = {marker.x * factor, marker.y * factor, marker.z * factor};
        return editor.SetValue(m_object, NMX::Paths::Markers(), std::move(markers));
      });
  if (scaled.Result() == EResult::Conflict)
    return {EResult::Conflict, "The object's markers have changed meanwhile."};
  if (!scaled.Failed())
    deleteLater();
  return scaled;
}

void VCalibrationScalingQml::cancel()
{
  deleteLater();
}

}
