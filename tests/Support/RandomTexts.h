#pragma once

#include <algorithm>
#include <cstddef>
#include <random>
#include <string>

/// Texts of every character that Unicode has, and more often of those that files and protocols trip over.
class RandomTexts
{
public:
  explicit RandomTexts(unsigned seed) : m_random(seed) {}

  /// At most so many bytes of UTF-8; now and then exactly as many, or none.
  std::string Text(std::size_t mostBytes)
  {
    const std::size_t length = Below(4) == 0   ? mostBytes
                               : Below(8) == 0 ? 0
                                               : Below(std::min<std::size_t>(mostBytes, 40));
    const bool plain = Below(2) == 0; // without what XML cannot hold
    std::string text;
    while (text.size() < length)
    {
      const std::string character = Character(plain);
      text += text.size() + character.size() <= length ? character : "x";
    }
    return text;
  }

  std::size_t Below(std::size_t limit) { return m_random() % limit; }

private:
  std::string Character(bool plain)
  {
    static const std::string special[] = {"]]>",    "<",      "&",      "\"",     "'",    "%",    "%41",
                                          "\\",     " ",      "\t",     "\n",     "\r",   "\r\n", "\u0085",
                                          "\u2028", "\u00A0", "\uFEFF", "\uFFFD", "&#1;", "<!--"};
    if (Below(2) == 0)
      return special[Below(std::size(special))];
    for (;;)
    {
      const auto code = static_cast<char32_t>(Below(3) == 0   ? Below(0x80)
                                              : Below(2) == 0 ? Below(0x10000)
                                                              : Below(0x110000));
      const bool surrogate = code >= 0xD800 && code < 0xE000;
      const bool noXml =
          (code < 0x20 && code != '\t' && code != '\n' && code != '\r') || code == 0xFFFE || code == 0xFFFF;
      if (!surrogate && !(plain && noXml))
        return Encoded(code);
    }
  }

  static std::string Encoded(char32_t code)
  {
    const auto byte = [](char32_t bits) { return static_cast<char>(static_cast<unsigned char>(bits)); };
    if (code < 0x80)
      return {byte(code)};
    if (code < 0x800)
      return {byte(0xC0 | code >> 6), byte(0x80 | (code & 0x3F))};
    if (code < 0x10000)
      return {byte(0xE0 | code >> 12), byte(0x80 | (code >> 6 & 0x3F)), byte(0x80 | (code & 0x3F))};
    return {byte(0xF0 | code >> 18), byte(0x80 | (code >> 12 & 0x3F)), byte(0x80 | (code >> 6 & 0x3F)),
            byte(0x80 | (code & 0x3F))};
  }

  std::mt19937 m_random;
};
