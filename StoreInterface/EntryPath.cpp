#include "StoreInterface/EntryPath.h"

#include <deque>
#include <mutex>
#include <shared_mutex>
#include <string>
#include <unordered_map>

namespace NMX
{

namespace
{

/// All paths of the program, numbered in the order in which they were first named.
class PathNumbers
{
public:
  std::uint32_t Number(std::string_view text)
  {
    const std::unique_lock lock(m_mutex);
    if (const auto known = m_numbers.find(text); known != m_numbers.end())
      return known->second;
    const auto number = static_cast<std::uint32_t>(m_texts.size());
    const std::string& kept = m_texts.emplace_back(text);
    m_numbers.emplace(kept, number);
    return number;
  }

  std::optional<std::uint32_t> Known(std::string_view text)
  {
    const std::shared_lock lock(m_mutex);
    const auto known = m_numbers.find(text);
    return known != m_numbers.end() ? std::optional(known->second) : std::nullopt;
  }

  std::string_view Text(std::uint32_t number)
  {
    const std::shared_lock lock(m_mutex);
    return m_texts[number];
  }

  static PathNumbers& Instance()
  {
    static PathNumbers numbers;
    return numbers;
  }

private:
  std::shared_mutex m_mutex;
  std::deque<std::string> m_texts; // a deque, because the map's keys look into its texts
  std::unordered_map<std::string_view, std::uint32_t> m_numbers;
};

}

EntryPath::EntryPath(std::string_view text) : m_number(PathNumbers::Instance().Number(text)) {}

std::optional<EntryPath> EntryPath::Known(std::string_view text)
{
  const auto number = PathNumbers::Instance().Known(text);
  return number ? std::optional(EntryPath(*number)) : std::nullopt;
}

std::string_view EntryPath::Text() const
{
  return PathNumbers::Instance().Text(m_number);
}

}
