#pragma once

#include <memory>

class ICalibrationNotifications;
class ISubjectCalibrationController;
class ISubjectCreator;

namespace RunaCorePluginInterface
{

/// A host that can calibrate subjects: hands out what that takes. None of it is empty. [host]
class ICalibrationProvider
{
public:
  virtual ~ICalibrationProvider() = default;

  virtual void Controller(std::shared_ptr<ISubjectCalibrationController>& controller) const = 0;
  virtual void SubjectCreator(std::shared_ptr<ISubjectCreator>& creator) const = 0;
  virtual void Notifications(std::shared_ptr<ICalibrationNotifications>& notifications) const = 0;
};

}
