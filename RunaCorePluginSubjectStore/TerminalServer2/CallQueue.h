#pragma once

#include "HostInterface/NMX/Caller.h"
#include "HostInterface/NMX/FileThreads.h"
#include "HostInterface/NMX/IPostalService.h"

#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <unordered_map>

namespace TerminalServer2
{

/// Where the calls of a group run: one at a time on its strand, in the order of posting. While a call waits for a file,
/// later calls of the same caller wait behind it in their order, and everybody else's go on. [strand], unless said
/// otherwise.
class CallQueue : public std::enable_shared_from_this<CallQueue>
{
public:
  /// One run of a call; true when the call now waits for a file, after which PostTurn is called.
  using Turn = std::function<bool()>;

  explicit CallQueue(std::shared_ptr<NMX::IPostalService> strand,
                     NMX::FileThreads& files = NMX::FileThreads::OfProgram())
      : m_strand(std::move(strand)), m_files(files)
  {
  }

  /// What looks at files. It outlives all queues.
  [[nodiscard]] NMX::FileThreads& Files() const { return m_files; }

  /// [any]
  void Post(std::function<void()> task) { m_strand->Post(std::move(task)); }

  /// Whether calls of that caller have to wait.
  [[nodiscard]] bool Holds(const NMX::Caller& caller) const { return !m_held.empty() && m_held.contains(caller.id); }

  /// From now on they have to.
  void Hold(const NMX::Caller& caller) { m_held.try_emplace(caller.id); }

  /// How much of arguments may wait for one caller.
  static constexpr std::size_t maximumBytes = std::size_t{8} << 20;

  /// Lets a call of such a caller, with so much of arguments, wait behind the others. False when too much waits.
  [[nodiscard]] bool Queue(const NMX::Caller& caller, std::size_t bytes, Turn turn);

  /// Posts a further run of the call for which the others wait. When it waits for nothing any more, the next of them
  /// follows. [any]
  void PostTurn(const NMX::Caller& caller, Turn turn);

private:
  struct Waiting
  {
    std::size_t bytes;
    Turn turn;
  };
  struct Held
  {
    std::deque<Waiting> calls;
    std::size_t bytes = 0; ///< of all of them
  };

  void Continue(const NMX::Caller& caller);

  const std::shared_ptr<NMX::IPostalService> m_strand;
  NMX::FileThreads& m_files;
  std::unordered_map<std::uint64_t, Held> m_held; // by caller
};

}
