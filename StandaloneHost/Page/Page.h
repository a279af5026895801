#pragma once

#include <span>
#include <string_view>

namespace Page
{

/// One file of the page with which a browser shows and tries out what the server offers.
struct File
{
  std::string_view target;  ///< such as "/page.js"
  std::string_view type;    ///< as in the header Content-Type
  std::string_view content; ///< lives as long as the program
};

/// All files of the page; the first is the page itself, at "/". They hold nothing of the API: the page reads its
/// description when it is shown.
[[nodiscard]] std::span<const File> Files();

}
