#pragma once

#include "HostInterface/RunaCorePluginInterface/IPanelServices.h"

#include <memory>
#include <utility>

namespace Panel
{

/// What the host has for the panel; what it does not have is empty.
struct ServicesForPanel
{
  std::shared_ptr<RunaCorePluginInterface::IFeatures> features = nullptr;
  std::shared_ptr<IRunaCoreFileIO> fileIO = nullptr;
  std::shared_ptr<IFileLocations> fileLocations = nullptr;
  std::shared_ptr<RunaCorePluginInterface::IObjectEvaluationSettings> objectEvaluation = nullptr;
  std::shared_ptr<ISmartObjectControls> smartObjects = nullptr;
  std::shared_ptr<ICharacterControls> characters = nullptr;
  std::shared_ptr<IDeviceServices> devices = nullptr;
  std::shared_ptr<RunaCorePluginInterface::ICalibrationProvider> calibration = nullptr;
};

/// Hands out the standalone host's services. [gui]
class VPanelServices final : public RunaCorePluginInterface::IPanelServices
{
public:
  explicit VPanelServices(ServicesForPanel services) : m_services(std::move(services)) {}

  void Features(std::shared_ptr<RunaCorePluginInterface::IFeatures>& features) const override
  {
    features = m_services.features;
  }
  void FileIO(std::shared_ptr<IRunaCoreFileIO>& fileIO) const override { fileIO = m_services.fileIO; }
  void FileLocations(std::shared_ptr<IFileLocations>& locations) const override
  {
    locations = m_services.fileLocations;
  }
  void
  ObjectEvaluationSettings(std::shared_ptr<RunaCorePluginInterface::IObjectEvaluationSettings>& settings) const override
  {
    settings = m_services.objectEvaluation;
  }
  void SmartObjectControls(std::shared_ptr<ISmartObjectControls>& controls) const override
  {
    controls = m_services.smartObjects;
  }
  void CharacterControls(std::shared_ptr<ICharacterControls>& controls) const override
  {
    controls = m_services.characters;
  }
  void Devices(std::shared_ptr<IDeviceServices>& devices) const override { devices = m_services.devices; }
  void CalibrationProvider(std::shared_ptr<RunaCorePluginInterface::ICalibrationProvider>& provider) const override
  {
    provider = m_services.calibration;
  }

private:
  const ServicesForPanel m_services;
};

}
