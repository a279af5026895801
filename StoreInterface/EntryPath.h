#pragma once

#include <compare>
#include <cstdint>
#include <functional>
#include <optional>
#include <ostream>
#include <string_view>
#include <utility>

namespace NMX
{

/// Path of a store entry, such as "Parameters/Name". Made from its text once, it is a small number from then on:
/// comparing and looking up never touch the text again. The number and the text live as long as somebody holds the
/// path; a constant is held for ever, and copying it costs nothing. [any]
class EntryPath
{
public:
  /// Numbers the text, unless it has a number.
  explicit EntryPath(std::string_view text);

  /// The same, for a path that the program itself names: it is never given back.
  [[nodiscard]] static EntryPath Constant(std::string_view text);

  /// The path with that text, if somebody holds it: for text that may come from anywhere.
  [[nodiscard]] static std::optional<EntryPath> Known(std::string_view text);

  EntryPath(const EntryPath& other) noexcept
      : m_numbered(other.m_numbered), m_number(other.m_number), m_counted(other.m_counted)
  {
    if (m_counted)
      Retain();
  }
  EntryPath& operator=(const EntryPath& other) noexcept
  {
    EntryPath copy(other);
    Swap(copy);
    return *this;
  }
  /// What is moved from holds a path as well, as there is none without a text.
  EntryPath(EntryPath&& other) noexcept : EntryPath(std::as_const(other)) {}
  EntryPath& operator=(EntryPath&& other) noexcept
  {
    Swap(other);
    return *this;
  }
  ~EntryPath()
  {
    if (m_counted)
      Release();
  }

  /// Nobody else has this number as long as the path is held.
  [[nodiscard]] std::uint32_t Number() const { return m_number; }
  /// Valid as long as the path is held.
  [[nodiscard]] std::string_view Text() const;

  friend bool operator==(const EntryPath& left, const EntryPath& right) { return left.m_number == right.m_number; }
  friend auto operator<=>(const EntryPath& left, const EntryPath& right) { return left.m_number <=> right.m_number; }
  friend std::ostream& operator<<(std::ostream& out, const EntryPath& path) { return out << path.Text(); }

private:
  friend class PathNumbers;
  struct Numbered;

  EntryPath(Numbered& numbered, bool counted);
  void Retain() const noexcept;
  void Release() const noexcept;
  void Swap(EntryPath& other) noexcept
  {
    std::swap(m_numbered, other.m_numbered);
    std::swap(m_number, other.m_number);
    std::swap(m_counted, other.m_counted);
  }

  Numbered* m_numbered;
  std::uint32_t m_number;
  bool m_counted; // whether it is one of the holders that are counted
};

}

template <>
struct std::hash<NMX::EntryPath>
{
  std::size_t operator()(const NMX::EntryPath& path) const noexcept { return path.Number(); }
};
