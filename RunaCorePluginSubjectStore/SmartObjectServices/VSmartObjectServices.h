#pragma once

#include "HostInterface/IFileLocations.h"
#include "HostInterface/ISmartObjectControls.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/ISmartObjectServices.h"
#include "RunaCorePluginSubjectStore/Subjects/ObjectServices.h"

namespace SmartObjectServices
{

/// Answers the remote group "SmartObjectServices" from the subject store, and from the host's smart-object controls
/// where objects are made or patterns handed out. Keeps no state of its own. [strand]
class VSmartObjectServices : public Subjects::ObjectServices<NMX::ISmartObjectServices>
{
public:
  /// The controls and the file locations may be missing.
  VSmartObjectServices(std::shared_ptr<NMX::IStore> store, std::shared_ptr<ISmartObjectControls> controls,
                       std::shared_ptr<IFileLocations> locations);

  NMX::IResult SmartObjectList(std::set<std::string>& names) const override;
  NMX::IResult Add(const std::string& name) override;
  NMX::IResult AddFromTemplate(const std::string& name, const std::string& templatePath) override;
  NMX::IResult CompatibleDeviceTypes(std::vector<std::string>& deviceTypes) const override;
  NMX::IResult CreateSmartObjects() override;
  NMX::IResult AssignOptimalActiveMarkerPatterns() override;
  NMX::IResult AutoPatternManagementEnabled(bool& enabled) const override;
  NMX::IResult SetAutoPatternManagementEnabled(bool enabled) override;
  NMX::IResult SmartClusterCount(const std::string& name, std::uint32_t& count) const override;
  NMX::IResult SmartClusterLabel(const std::string& name, std::uint32_t index, std::string& label) const override;
  NMX::IResult SetSmartClusterLabel(const std::string& name, std::uint32_t index, const std::string& label) override;
  NMX::IResult SmartClusterActiveMarkerPattern(const std::string& name, std::uint32_t index,
                                               std::uint32_t& pattern) const override;
  NMX::IResult SetSmartClusterActiveMarkerPattern(const std::string& name, std::uint32_t index,
                                                  std::uint32_t pattern) override;
  NMX::IResult SmartClusterDeviceURN(const std::string& name, std::uint32_t index,
                                     std::string& deviceUrn) const override;
  NMX::IResult SetSmartClusterDeviceURN(const std::string& name, std::uint32_t index,
                                        const std::string& deviceUrn) override;
  NMX::IResult ActiveMarkersOnWhileCharging(const std::string& name, bool& onWhileCharging) const override;
  NMX::IResult SetActiveMarkersOnWhileCharging(const std::string& name, bool onWhileCharging) override;
  NMX::IResult SmartObjectWarnings(const std::string& name,
                                   std::map<ESmartObjectWarning, std::string>& warnings) const override;
  std::shared_ptr<ChangedCallback> SmartObjectChangedCallback() override;

private:
  template <class Read>
  NMX::IResult ReadCluster(const std::string& name, std::uint32_t index, Read read) const;
  template <class Edit>
  NMX::IResult EditCluster(const std::string& name, std::uint32_t index, Edit edit);
  [[nodiscard]] std::string DefaultTemplate() const;

  const std::shared_ptr<ISmartObjectControls> m_controls;
  const std::shared_ptr<IFileLocations> m_locations;
};

}
