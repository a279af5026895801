#pragma once

#include "StandaloneHost/CommandLine/Client.h"
#include "StandaloneHost/CommandLine/ProgressDisplay.h"

#include <memory>
#include <optional>
#include <span>
#include <string>

namespace CommandLine
{

/// How far work has come.
struct Step
{
  enum class EState
  {
    GoesOn,
    EndedWell,
    Failed
  };

  EState state = EState::GoesOn;
  std::string text; ///< visible
  std::optional<Count> count;
};

/// Work that a call begins and that goes on after the answer.
class ILongWork
{
public:
  virtual ~ILongWork() = default;

  /// What it is, and how else its end is seen; for people who do not wait.
  [[nodiscard]] virtual std::string Hint() const = 0;

  /// The callback that tells of its progress, to be subscribed to before the call.
  [[nodiscard]] virtual std::string Callback() const = 0;

  /// Takes in what the call was answered: raw JSON of the result.
  virtual void Begin(const std::string& result) = 0;

  virtual void Hear(const Notification& notification) = 0;

  /// Asks the host how far it has come. Throws HostError, Ended.
  [[nodiscard]] virtual Step Look(Client& client) = 0;
};

/// The work that this call begins; null when there is nothing to wait for. `inputs`: raw JSON, in the function's order.
[[nodiscard]] std::unique_ptr<ILongWork> WorkBegunBy(std::string_view method, std::span<const std::string> inputs);

}
