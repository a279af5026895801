#pragma once

#include <functional>

namespace NMX
{

/// Runs tasks later, elsewhere. [any]
class IPostalService
{
public:
  IPostalService() = default;
  IPostalService(const IPostalService&) = delete;
  IPostalService& operator=(const IPostalService&) = delete;
  virtual ~IPostalService() = default;

  /// Queues a task and returns at once: the task never runs inside Post. A task must not throw.
  virtual void Post(std::function<void()> task) = 0;
};

}
