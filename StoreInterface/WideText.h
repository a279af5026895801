#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace NMX
{

/// UTF-8 as wide text; nothing when it is not valid UTF-8.
[[nodiscard]] std::optional<std::wstring> ToWide(std::string_view utf8);

/// Wide text as UTF-8; nothing when it holds what is not a character.
[[nodiscard]] std::optional<std::string> ToUtf8(std::wstring_view wide);

}
