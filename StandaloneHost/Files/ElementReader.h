#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StandaloneHost/Files/TextFile.h"

#include <cstddef>
#include <filesystem>
#include <initializer_list>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Files
{

/// The start of an element, with its attributes in their order.
struct Element
{
  std::string name;
  std::vector<std::pair<std::string, std::string>> attributes;
  Place place;

  /// Throws when there is an attribute of another name.
  void AllowAttributes(std::initializer_list<std::string_view> names) const;
  /// Null when there is no such attribute.
  [[nodiscard]] const std::string* Attribute(std::string_view attribute) const;
  /// Throws when there is no such attribute.
  [[nodiscard]] const std::string& RequiredAttribute(std::string_view attribute) const;
  /// As RequiredAttribute, and throws when it is empty.
  [[nodiscard]] const std::string& FilledAttribute(std::string_view attribute) const;
};

/// Throws: the element is none of those that may stand at its place.
[[noreturn]] void FailUnknown(const Element& element, std::span<const std::string_view> expected);

/// Walks through the elements of an XML file in their order; each that is entered must be left again. Whatever is
/// wrong, also with the file itself, is thrown as ConfigurationError.
class ElementReader
{
public:
  explicit ElementReader(const std::filesystem::path& file, std::size_t maximumBytes = maximumFileBytes);
  ~ElementReader();

  /// Enters the file's outermost element, which must have that name.
  [[nodiscard]] Element EnterRoot(std::string_view name);
  /// Enters the next child of the element that was entered last; leaves that one when there is none.
  [[nodiscard]] std::optional<Element> EnterChild();
  /// The text of the element that was entered last, which has no children, and leaves it.
  [[nodiscard]] std::string LeaveWithText();
  /// Leaves the element that was entered last, which must be empty.
  void LeaveEmpty();
  /// To be called when the outermost element was left: nothing may follow.
  void End();

private:
  class Tokens;
  std::unique_ptr<Tokens> m_tokens;
};

}
