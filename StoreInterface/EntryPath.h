#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <ostream>
#include <string_view>

namespace NMX
{

/// Path of a store entry, such as "Parameters/Name". Made from its text once, it is a small number from then on:
/// copying, comparing and looking up never touch the text again. [any]
class EntryPath
{
public:
  /// Numbers the text, which stays numbered until the program ends: paths are for constants and for entries that
  /// exist, never for text that a client may choose freely.
  explicit EntryPath(std::string_view text);

  /// The path with that text, if it has been numbered: for text that may come from anywhere.
  [[nodiscard]] static std::optional<EntryPath> Known(std::string_view text);

  [[nodiscard]] std::uint32_t Number() const { return m_number; }
  [[nodiscard]] std::string_view Text() const;

  friend auto operator<=>(EntryPath, EntryPath) = default;
  friend std::ostream& operator<<(std::ostream& out, EntryPath path) { return out << path.Text(); }

private:
  explicit EntryPath(std::uint32_t number) : m_number(number) {}

  std::uint32_t m_number;
};

}

template <>
struct std::hash<NMX::EntryPath>
{
  std::size_t operator()(NMX::EntryPath path) const noexcept { return path.Number(); }
};
