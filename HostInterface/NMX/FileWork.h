#pragma once

#include "HostInterface/NMX/CallContext.h"
#include "HostInterface/NMX/FileThreads.h"

#include <cstddef>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <string_view>
#include <vector>

namespace NMX
{

/// What one call asks of files, and what came of it. The operation runs on the thread that serves; where it needs to
/// know of a file what is not known yet, that is noted, the operation ends, a thread of its own looks at the file, and
/// the operation runs once more. Operations use LookAtFile; the rest is for the binding. [strand]
class FileWork
{
public:
  using Value = std::shared_ptr<const void>;
  using Look = std::function<Value()>;
  using LookKey = void (*)(); ///< one for each function that looks

  /// What a call may ask for; afterwards nothing answers.
  static constexpr std::size_t maximumFiles = 4;

  /// What `look` found; null when there is no answer (yet), which is noted. Throws what `look` threw.
  [[nodiscard]] Value Ask(const std::filesystem::path& file, LookKey key, Look look);

  /// Whether something is noted that has not ended.
  [[nodiscard]] bool Waits() const;

  /// Has the threads look at what is noted. `ended` as for FileThreads::Run.
  void Begin(FileThreads& threads, FileThreads::Ended ended);

  /// What `ended` was told. Logs what the function `name` has to do without.
  void End(EFileEnd end, std::string_view name, std::chrono::milliseconds patience);

private:
  struct Found;

  struct Asked
  {
    std::filesystem::path file;
    LookKey key;
    Look look;
    std::shared_ptr<Found> found; ///< also the thread's until the end
    std::optional<EFileEnd> end;
  };

  std::vector<Asked> m_asked; // at most the last has not ended
};

/// What `look` finds at `file`. On a thread that carries out a call it may be null, as the file has not answered: the
/// operation then returns the result that it has for a file that cannot be read, and has changed nothing. If the
/// answer is still to come, the operation runs again when it is there. On any other thread `look` runs at once; no
/// edit may be open meanwhile in either case.
///
/// `look` may run on another thread, and still run when the host has ended: it uses nothing but the path, and does not
/// log. It reads and parses, as both take their time.
template <class T>
[[nodiscard]] std::shared_ptr<const T> LookAtFile(const std::filesystem::path& file,
                                                  T (*look)(const std::filesystem::path&))
{
  const CallContext* const context = CallContext::Current();
  if (context == nullptr || context->Files() == nullptr)
    return std::make_shared<const T>(look(file));
  return std::static_pointer_cast<const T>(
      context->Files()->Ask(file, reinterpret_cast<FileWork::LookKey>(look),
                            [file, look]() -> FileWork::Value { return std::make_shared<const T>(look(file)); }));
}

}
