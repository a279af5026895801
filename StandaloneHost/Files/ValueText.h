#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StoreInterface/Value.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace Files
{

/// True when a value of that type can be written as one text.
[[nodiscard]] bool HasText(NMX::EValueType type);

/// Reads a text exactly as it stands, white space included, into a value of the type. Throws when it gives none;
/// `what` says what the text is of, such as "<Enabled>".
[[nodiscard]] NMX::Value ReadValue(NMX::EValueType type, const Place& place, std::string_view what,
                                   std::string_view text);

/// The text from which ReadValue reads the value again; its type has one.
[[nodiscard]] std::string TextOf(const NMX::Value& value);

/// As ReadValue, for a type that is known beforehand.
template <class T>
[[nodiscard]] T ReadAs(const Place& place, std::string_view what, std::string_view text)
{
  return std::get<T>(ReadValue(NMX::TypeOf(NMX::Value(T{})), place, what, text));
}

}
