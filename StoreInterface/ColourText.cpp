#include "StoreInterface/ColourText.h"

#include <charconv>

namespace NMX
{

namespace
{

constexpr bool IsHexadecimalDigit(char c)
{
  return (c >= '0' && c <= '9') || (c >= 'a' && c <= 'f') || (c >= 'A' && c <= 'F');
}

}

std::string ColourToText(const Colour& colour)
{
  static constexpr std::string_view digits = "0123456789abcdef";
  std::string text = "#";
  for (const std::uint8_t channel : {colour.alpha, colour.red, colour.green, colour.blue})
  {
    text += digits[channel >> 4];
    text += digits[channel & 0xF];
  }
  return text;
}

IResult ColourFromText(std::string_view text, Colour& colour)
{
  if ((text.size() != 7 && text.size() != 9) || text.front() != '#')
    return EResult::InvalidArgument;
  text.remove_prefix(1);
  for (const char c : text)
    if (!IsHexadecimalDigit(c))
      return EResult::InvalidArgument;

  const auto nextPair = [&text]
  {
    std::uint8_t channel = 0;
    (void)std::from_chars(text.data(), text.data() + 2, channel, 16);
    text.remove_prefix(2);
    return channel;
  };
  Colour read;
  if (text.size() == 8)
    read.alpha = nextPair();
  read.red = nextPair();
  read.green = nextPair();
  read.blue = nextPair();
  colour = read;
  return EResult::Ok;
}

}
