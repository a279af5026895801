#include "HostInterface/NMX/FileWork.h"

#include "HostInterface/NMX/GlobalLog.h"

#include <algorithm>
#include <exception>
#include <string>
#include <utility>

namespace NMX
{

struct FileWork::Found
{
  Value value;
  std::exception_ptr failure;
};

namespace
{

/// A path from outside as a log shows it: on one line, and not all of one that is very long.
std::string Shown(const std::filesystem::path& file)
{
  constexpr std::size_t most = 300;
  std::string text = file.string();
  if (text.size() > most)
  {
    std::size_t end = most;
    while ((static_cast<unsigned char>(text[end]) & 0xC0) == 0x80 && end > 0)
      --end;
    text = text.substr(0, end) + "...";
  }
  std::replace_if(text.begin(), text.end(), [](unsigned char c) { return c < 0x20 || c == 0x7F; }, ' ');
  return text;
}

}

FileWork::Value FileWork::Ask(const std::filesystem::path& file, LookKey key, Look look)
{
  const auto asked = std::find_if(m_asked.begin(), m_asked.end(),
                                  [&](const Asked& each) { return each.key == key && each.file == file; });
  if (asked != m_asked.end())
  {
    if (asked->end != EFileEnd::Answered)
      return nullptr;
    if (asked->found->failure)
      std::rethrow_exception(asked->found->failure);
    return asked->found->value;
  }
  if (Waits())
    return nullptr; // one after the other
  if (m_asked.size() < maximumFiles)
    m_asked.push_back({file, key, std::move(look), nullptr, {}});
  else
    Log(serverLog, ESeverity::Error, "\"%1%\" is not looked at: one call asks for too many files", Shown(file));
  return nullptr;
}

bool FileWork::Waits() const
{
  return !m_asked.empty() && !m_asked.back().end;
}

void FileWork::Begin(FileThreads& threads, FileThreads::Ended ended)
{
  Asked& asked = m_asked.back();
  asked.found = std::make_shared<Found>();
  threads.Run(
      [found = asked.found, look = std::exchange(asked.look, nullptr)]
      {
        try
        {
          found->value = look();
        }
        catch (...)
        {
          found->failure = std::current_exception();
        }
      },
      std::move(ended));
}

void FileWork::End(EFileEnd end, std::string_view name, std::chrono::milliseconds patience)
{
  Asked& asked = m_asked.back();
  asked.end = end;
  if (end == EFileEnd::Answered)
    return;
  asked.found.reset(); // it may still be written
  if (end == EFileEnd::TimedOut)
    Log(serverLog, ESeverity::Error, "%1%: \"%2%\" did not answer within %3% s", name, Shown(asked.file),
        std::chrono::duration<double>(patience).count());
  else
    Log(serverLog, ESeverity::Error, "%1%: \"%2%\" is not looked at, as too many files do not answer", name,
        Shown(asked.file));
}

}
