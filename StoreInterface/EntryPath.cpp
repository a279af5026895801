#include "StoreInterface/EntryPath.h"

#include <atomic>
#include <memory>
#include <mutex>
#include <shared_mutex>
#include <string>
#include <unordered_map>
#include <vector>

namespace NMX
{

/// A text that has a number.
struct EntryPath::Numbered
{
  std::string text;
  std::uint32_t number;
  bool constant = false; // has one holder more then, for ever
  std::atomic<std::uint32_t> holders = 0;
};

/// All paths of the program, by their texts. The last holder leaves, and others come, under the mutex, so that what is
/// found here is held by somebody. [any]
class PathNumbers
{
public:
  EntryPath Path(std::string_view text, bool constant)
  {
    const std::unique_lock lock(m_mutex);
    const auto known = m_paths.find(text);
    EntryPath::Numbered& numbered = known != m_paths.end() ? *known->second : Add(text);
    if (constant && !std::exchange(numbered.constant, true))
      ++numbered.holders;
    return Held(numbered);
  }

  std::optional<EntryPath> Known(std::string_view text)
  {
    const std::shared_lock lock(m_mutex);
    const auto known = m_paths.find(text);
    return known != m_paths.end() ? std::optional(Held(*known->second)) : std::nullopt;
  }

  void Release(EntryPath::Numbered& numbered)
  {
    std::uint32_t holders = numbered.holders.load(std::memory_order_relaxed);
    while (holders > 1)
      if (numbered.holders.compare_exchange_weak(holders, holders - 1, std::memory_order_release,
                                                 std::memory_order_relaxed))
        return;
    const std::unique_lock lock(m_mutex);
    if (numbered.holders.fetch_sub(1, std::memory_order_acq_rel) != 1)
      return; // somebody has come in between
    m_free.push_back(numbered.number);
    m_paths.erase(m_paths.find(numbered.text));
  }

  static PathNumbers& Instance()
  {
    static auto* const numbers = new PathNumbers; // never destroyed: static objects hold paths
    return *numbers;
  }

private:
  static EntryPath Held(EntryPath::Numbered& numbered)
  {
    if (!numbered.constant)
      ++numbered.holders;
    return {numbered, !numbered.constant};
  }

  EntryPath::Numbered& Add(std::string_view text)
  {
    const bool reused = !m_free.empty();
    auto numbered = std::make_unique<EntryPath::Numbered>();
    numbered->text = text;
    numbered->number = reused ? m_free.back() : static_cast<std::uint32_t>(m_paths.size());
    EntryPath::Numbered& added = *numbered;
    m_paths.emplace(added.text, std::move(numbered));
    if (reused)
      m_free.pop_back();
    return added;
  }

  std::shared_mutex m_mutex;
  std::unordered_map<std::string_view, std::unique_ptr<EntryPath::Numbered>> m_paths; // keys look into the texts
  std::vector<std::uint32_t> m_free;                                                  // numbers below that of all paths
};

EntryPath::EntryPath(Numbered& numbered, bool counted)
    : m_numbered(&numbered), m_number(numbered.number), m_counted(counted)
{
}

EntryPath::EntryPath(std::string_view text) : EntryPath(PathNumbers::Instance().Path(text, false)) {}

EntryPath EntryPath::Constant(std::string_view text)
{
  return PathNumbers::Instance().Path(text, true);
}

std::optional<EntryPath> EntryPath::Known(std::string_view text)
{
  return PathNumbers::Instance().Known(text);
}

std::string_view EntryPath::Text() const
{
  return m_numbered->text;
}

void EntryPath::Retain() const noexcept
{
  m_numbered->holders.fetch_add(1, std::memory_order_relaxed);
}

void EntryPath::Release() const noexcept
{
  PathNumbers::Instance().Release(*m_numbered);
}

}
