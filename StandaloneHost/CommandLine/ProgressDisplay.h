#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace CommandLine
{

/// Of how many steps how many are done.
struct Count
{
  std::uint64_t done;
  std::uint64_t required;
};

/// A bar of a width in characters: "[####----]  50%".
[[nodiscard]] std::string Bar(const Count& count, std::size_t width);

/// Shows on standard error how far work has come: a line that is drawn again and again on a terminal, elsewhere a line
/// for each step, of which every tenth of a count is one.
class ProgressDisplay
{
public:
  ProgressDisplay();
  ProgressDisplay(const ProgressDisplay&) = delete;
  ProgressDisplay& operator=(const ProgressDisplay&) = delete;

  /// Ends the line, if one is drawn.
  ~ProgressDisplay();

  /// `text` is visible.
  void Show(const std::string& text, const std::optional<Count>& count);

private:
  const std::size_t m_width; ///< 0: no terminal
  std::string m_shown;
  bool m_drawn = false;
};

}
