#pragma once

#include "HostInterface/RunaCorePluginInterface/ICalibrationProvider.h"
#include "HostInterface/RunaCorePluginInterface/IPlugin.h"
#include "RunaCorePluginSubjectStore/BasicObjectServices/VBasicObjectServices.h"
#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/VCharacterFromClustersServices.h"
#include "RunaCorePluginSubjectStore/ObjectEvaluationServices/VObjectEvaluationServices.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/VSmartObjectServices.h"
#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/VSubjectCalibrationServices.h"
#include "SubjectStoreUI/VSubjectStoreOfflineQml.h"
#include "SubjectStoreUI/VSubjectStoreQml.h"

#include <memory>

/// The plugin: makes its services from what the host hands out and gives them to the host's server, and the panel,
/// which it gives to the host's QML engine and menus. [host]
///
/// The members are released in reverse order of their declaration. A service lives on while the server still holds a
/// function of it, so the host withdraws the functions before it destroys the plugin; QML that uses the panel's objects
/// has to be gone by then.
class VRunaCorePluginSubjectStore final : public RunaCorePluginInterface::IPlugin
{
public:
  [[nodiscard]] const char* DisplayName() const override;

  /// Makes and publishes the service groups that the feature mask allows, and subject calibration when the host
  /// provides it. Always true.
  bool RegisterServices(RunaCorePluginInterface::IPluginHost& host) override;

  /// Registers the panel's QML module and publishes the panel's objects; the rigid-object manager too, unless somebody
  /// has registered that. True, unless the host lacks the store or the GUI thread's postal service. [gui]
  bool RegisterQml(RunaCorePluginInterface::IPluginHost& host,
                   RunaCorePluginInterface::IQmlContext& qmlContext) override;

  /// Adds "Assign &Smart Object Patterns" to the menu "&Edit". [gui]
  bool RegisterUserInterface(RunaCorePluginInterface::IPluginHost& host,
                             RunaCorePluginInterface::IUserInterface& userInterface) override;

  /// Withdraws the rigid-object manager. [gui]
  void UnregisterQml() override;

private:
  void RegisterSubjectCalibration(const RunaCorePluginInterface::IPluginHost& host,
                                  const RunaCorePluginInterface::ICalibrationProvider& provider);

  std::unique_ptr<SubjectStoreUI::VSubjectStoreQml> m_subjectStoreQml;
  std::unique_ptr<SubjectStoreUI::VSubjectStoreOfflineQml> m_subjectStoreOfflineQml;
  std::shared_ptr<BasicObjectServices::VBasicObjectServices> m_basicObjectServices;
  std::shared_ptr<ObjectEvaluationServices::VObjectEvaluationServices> m_objectEvaluationServices;
  std::shared_ptr<SmartObjectServices::VSmartObjectServices> m_smartObjectServices;
  std::shared_ptr<SubjectCalibrationServices::VSubjectCalibrationServices> m_subjectCalibrationServices;
  std::shared_ptr<CharacterFromClustersServices::VCharacterFromClustersServices> m_characterFromClustersServices;
};
