#include "SubjectStoreUI/NaturalOrder.h"

#include <algorithm>

namespace SubjectStoreUI
{

namespace
{

bool IsDigit(char character)
{
  return character >= '0' && character <= '9';
}

int LowerCase(char character)
{
  const int byte = static_cast<unsigned char>(character);
  return byte >= 'A' && byte <= 'Z' ? byte - 'A' + 'a' : byte;
}

/// Cuts the digits off that the text begins with; returns them without leading zeros.
std::string_view TakeNumber(std::string_view& text)
{
  const auto end = std::ranges::find_if_not(text, IsDigit);
  const std::string_view digits(text.begin(), end);
  text.remove_prefix(digits.size());
  return digits.substr(std::min(digits.find_first_not_of('0'), digits.size()));
}

int CompareNumbers(std::string_view a, std::string_view b)
{
  if (a.size() != b.size())
    return a.size() < b.size() ? -1 : 1;
  return a.compare(b);
}

}

int CompareNaturally(std::string_view a, std::string_view b)
{
  while (!a.empty() && !b.empty())
  {
    int result = 0;
    if (IsDigit(a.front()) && IsDigit(b.front()))
    {
      const std::string_view number = TakeNumber(a);
      result = CompareNumbers(number, TakeNumber(b));
    }
    else if (IsDigit(a.front()) || IsDigit(b.front()))
      return IsDigit(a.front()) ? -1 : 1;
    else
    {
      result = LowerCase(a.front()) - LowerCase(b.front());
      a.remove_prefix(1);
      b.remove_prefix(1);
    }
    if (result != 0)
      return result;
  }
  return static_cast<int>(b.empty()) - static_cast<int>(a.empty());
}

bool NaturallyLess(std::string_view a, std::string_view b)
{
  const int result = CompareNaturally(a, b);
  return result != 0 ? result < 0 : a < b;
}

}
