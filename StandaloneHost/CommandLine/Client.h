#pragma once

#include "StandaloneHost/CommandLine/Channel.h"

#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace CommandLine
{

/// What a call was answered with.
struct Answer
{
  bool failed = false;
  std::string json; ///< the answer's "result" or "error" as it stands, in one line
};

/// A change that the host tells of.
struct Notification
{
  std::string name;
  std::string params; ///< raw JSON, an object
};

/// Members of an object with their raw values, in the order of the text; each text is valid JSON.
using RawMembers = std::vector<std::pair<std::string, std::string>>;

/// The members of a JSON object. Throws HostError when the text is anything else.
[[nodiscard]] RawMembers ReadObject(std::string_view json);

/// The value of a member; empty when there is none.
[[nodiscard]] std::string Member(const RawMembers& members, std::string_view name);

/// The text of a raw JSON string; empty for anything else.
[[nodiscard]] std::string TextOf(std::string_view json);

/// A raw whole number that is not negative; none for anything else.
[[nodiscard]] std::optional<std::uint64_t> NumberOf(std::string_view json);

/// A text as a JSON string. The text has to be UTF-8.
[[nodiscard]] std::string JsonString(std::string_view text);

/// Calls a host and hears its notifications. Operations throw HostError when the host cannot be talked to, and Ended.
class Client
{
public:
  /// Connects and reads the greeting.
  Client(Target target, Loop& loop);
  Client(const Client&) = delete;
  Client& operator=(const Client&) = delete;
  ~Client();

  /// `params`: a raw JSON array or object.
  [[nodiscard]] Answer Call(const std::string& method, const std::string& params);

  /// The next notification; none when none has come within the time.
  [[nodiscard]] std::optional<Notification> Next(std::chrono::milliseconds time);

  /// New at each start of the host.
  [[nodiscard]] const std::string& Epoch() const { return m_epoch; }

  [[nodiscard]] const Target& Host() const { return m_target; }

private:
  RawMembers ReadMessage(const std::string& text) const;
  void Greet();
  void Keep(const RawMembers& message);

  const Target m_target;
  const std::shared_ptr<IChannel> m_channel;
  std::deque<Notification> m_notifications;
  std::string m_epoch;
  std::uint64_t m_lastId = 0;
};

}
