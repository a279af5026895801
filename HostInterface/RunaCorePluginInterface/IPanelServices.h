#pragma once

#include <memory>

class ICharacterControls;
class IDeviceServices;
class IFileLocations;
class IRunaCoreFileIO;
class ISmartObjectControls;

namespace RunaCorePluginInterface
{

class ICalibrationProvider;
class IFeatures;
class IObjectEvaluationSettings;

/// What the subject panel works with beside the store. Each operation fills its argument; what the host does not have
/// leaves an empty pointer. [gui]
class IPanelServices
{
public:
  IPanelServices() = default;
  IPanelServices(const IPanelServices&) = delete;
  IPanelServices& operator=(const IPanelServices&) = delete;
  virtual ~IPanelServices() = default;

  virtual void Features(std::shared_ptr<IFeatures>& features) const = 0;
  virtual void FileIO(std::shared_ptr<IRunaCoreFileIO>& fileIO) const = 0;
  virtual void FileLocations(std::shared_ptr<IFileLocations>& locations) const = 0;
  virtual void ObjectEvaluationSettings(std::shared_ptr<IObjectEvaluationSettings>& settings) const = 0;
  virtual void SmartObjectControls(std::shared_ptr<ISmartObjectControls>& controls) const = 0;
  virtual void CharacterControls(std::shared_ptr<ICharacterControls>& controls) const = 0;
  virtual void Devices(std::shared_ptr<IDeviceServices>& devices) const = 0;
  virtual void CalibrationProvider(std::shared_ptr<ICalibrationProvider>& provider) const = 0;
};

}
