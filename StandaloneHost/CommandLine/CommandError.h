#pragma once

#include <stdexcept>
#include <string>

namespace CommandLine
{

/// Exit statuses, as the documentation promises them.
enum class EStatus
{
  Success = 0,
  Failed = 1,     ///< the host carried the call out and answered that it failed
  Usage = 2,      ///< the command line cannot be followed
  Unreachable = 3 ///< the host cannot be reached, refuses, or does not speak as it should
};

/// What ends a command; the text is one line for people.
class CommandError : public std::runtime_error
{
public:
  CommandError(EStatus status, const std::string& text) : std::runtime_error(text), m_status(status) {}

  [[nodiscard]] EStatus Status() const { return m_status; }

private:
  EStatus m_status;
};

inline CommandError UsageError(const std::string& text)
{
  return {EStatus::Usage, text};
}

/// A host that cannot be talked to. `lasting`: to try again would be of no use.
class HostError : public CommandError
{
public:
  explicit HostError(const std::string& text, bool lasting = false)
      : CommandError(EStatus::Unreachable, text), m_lasting(lasting)
  {
  }

  [[nodiscard]] bool Lasting() const { return m_lasting; }

private:
  bool m_lasting;
};

/// SIGINT, SIGTERM, or nobody who reads the output any more: the command ends without a complaint.
struct Ended
{
};

}
