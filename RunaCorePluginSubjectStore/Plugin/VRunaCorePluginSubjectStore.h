#pragma once

#include "HostInterface/RunaCorePluginInterface/ICalibrationProvider.h"
#include "HostInterface/RunaCorePluginInterface/IPlugin.h"
#include "RunaCorePluginSubjectStore/BasicObjectServices/VBasicObjectServices.h"
#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/VCharacterFromClustersServices.h"
#include "RunaCorePluginSubjectStore/ObjectEvaluationServices/VObjectEvaluationServices.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/VSmartObjectServices.h"
#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/VSubjectCalibrationServices.h"

#include <memory>

/// The plugin: makes its services from what the host hands out and gives them to the host's server. [host]
///
/// The services are released in reverse order of their declaration. Each lives on while the server still holds a
/// function of it, so the host withdraws the functions before it destroys the plugin.
class VRunaCorePluginSubjectStore final : public RunaCorePluginInterface::IPlugin
{
public:
  [[nodiscard]] const char* DisplayName() const override;

  /// Makes and publishes the service groups that the feature mask allows, and subject calibration when the host
  /// provides it. Always true.
  bool RegisterServices(RunaCorePluginInterface::IPluginHost& host) override;

private:
  void RegisterSubjectCalibration(const RunaCorePluginInterface::IPluginHost& host,
                                  const RunaCorePluginInterface::ICalibrationProvider& provider);

  std::shared_ptr<BasicObjectServices::VBasicObjectServices> m_basicObjectServices;
  std::shared_ptr<ObjectEvaluationServices::VObjectEvaluationServices> m_objectEvaluationServices;
  std::shared_ptr<SmartObjectServices::VSmartObjectServices> m_smartObjectServices;
  std::shared_ptr<SubjectCalibrationServices::VSubjectCalibrationServices> m_subjectCalibrationServices;
  std::shared_ptr<CharacterFromClustersServices::VCharacterFromClustersServices> m_characterFromClustersServices;
};
