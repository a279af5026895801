#pragma once

#include <string_view>

namespace Page
{

/// The files of the built page, as they stand in built/. Defined in a source file that the build makes of them.
extern const std::string_view index_html;
extern const std::string_view page_css;
extern const std::string_view page_js;

}
