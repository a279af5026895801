#pragma once

#include "HostInterface/NMX/IResult.h"

#include <chrono>
#include <cstdint>
#include <mutex>
#include <string>

namespace Store
{

class DatabaseError;

/// Tells in the log, once each, that changes cannot be kept and that they can be kept again, however many edits are
/// refused meanwhile; and decides when to try again. The archive's owner guards it, except for what is tagged [any].
class FaultReport
{
public:
  explicit FaultReport(std::string file) : m_file(std::move(file)) {}

  /// True from the first failure until it is over.
  [[nodiscard]] bool Active() const { return m_active; }

  /// Whether an edit is to be refused without trying: trying takes at most a tenth of the time. Counts it if so.
  [[nodiscard]] bool RefusesUntried();

  /// An attempt that began then has failed.
  void Failed(const DatabaseError& failure, std::chrono::steady_clock::time_point begin);

  /// An attempt has succeeded; `madeAnew` when the file was written anew for it.
  void Succeeded(bool madeAnew);

  /// The host ends, and the last attempt has failed. `subjects` are not in the file, or it is as it should be but for
  /// the refused edits.
  void EndsWith(const DatabaseError& failure, bool fileIsWhole, std::size_t subjects);

  /// What the latest attempt came to.
  [[nodiscard]] NMX::IResult Result() const { return m_result; }

  /// Why changes cannot be kept, as one sentence; empty while they can. [any]
  [[nodiscard]] std::string Text() const;

private:
  using Clock = std::chrono::steady_clock;

  void SetReason(std::string reason);

  const std::string m_file;
  bool m_active = false;
  NMX::IResult m_result = NMX::EResult::Ok;
  std::uint64_t m_refused = 0;
  Clock::time_point m_since, m_nextAttempt, m_nextLine;
  mutable std::mutex m_mutex; // alone
  std::string m_reason;
};

}
