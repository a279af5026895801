#include "StoreInterface/WideText.h"

#include <boost/locale/encoding_utf.hpp>

namespace NMX
{

std::optional<std::wstring> ToWide(std::string_view utf8)
{
  try
  {
    return boost::locale::conv::utf_to_utf<wchar_t>(utf8.data(), utf8.data() + utf8.size(), boost::locale::conv::stop);
  }
  catch (const boost::locale::conv::conversion_error&)
  {
    return std::nullopt;
  }
}

std::optional<std::string> ToUtf8(std::wstring_view wide)
{
  try
  {
    return boost::locale::conv::utf_to_utf<char>(wide.data(), wide.data() + wide.size(), boost::locale::conv::stop);
  }
  catch (const boost::locale::conv::conversion_error&)
  {
    return std::nullopt;
  }
}

}
