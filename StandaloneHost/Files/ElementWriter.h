#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Files
{

/// Puts together the text of an XML file, element by element, as ElementReader reads it. The texts of an element,
/// of which one has characters that XML cannot hold, are encoded. Throws ConfigurationError for a text that is no
/// UTF-8.
class ElementWriter
{
public:
  using Attributes = std::vector<std::pair<std::string_view, std::string>>;

  /// Opens the outermost element, of version 1.
  explicit ElementWriter(std::string_view root);

  void Open(std::string_view name, const Attributes& attributes = {});
  /// Closes the element that was opened last.
  void Close();
  /// The same, but takes it back when nothing was written in it.
  void CloseUnlessEmpty();

  void Add(std::string_view name, const Attributes& attributes);
  void AddText(std::string_view name, std::string_view text);

  /// Closes the outermost element, the only one that is open.
  [[nodiscard]] std::string Finish();

private:
  struct Level
  {
    std::string name;
    std::size_t begin; // of the text that opened it
    bool wasInTag;     // before it
  };

  void BeginLine();
  void AppendTag(std::string_view name, const Attributes& attributes);

  std::string m_text;
  std::vector<Level> m_levels;
  bool m_inTag = false; // the latest tag has no end yet
};

}
