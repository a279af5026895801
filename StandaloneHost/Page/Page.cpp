#include "StandaloneHost/Page/Page.h"

#include "StandaloneHost/Page/Content.h"

#include <array>

namespace Page
{

std::span<const File> Files()
{
  static const std::array<File, 3> files{{{"/", "text/html; charset=utf-8", index_html},
                                          {"/page.css", "text/css; charset=utf-8", page_css},
                                          {"/page.js", "text/javascript; charset=utf-8", page_js}}};
  return files;
}

}
