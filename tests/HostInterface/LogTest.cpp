#include "HostInterface/LoggingDetail/PrintableText.h"
#include "tests/Support/LogCapture.h"

#include <gmock/gmock.h>

#include <ostream>
#include <stdexcept>

using NMX::ESeverity;
using NMX::Log;
using NMX::systemLog;
using testing::ElementsAre;

namespace
{

/// Counts how often it is written; or fails at it.
struct Watched
{
  int& written;
  bool fails = false;

  friend std::ostream& operator<<(std::ostream& out, const Watched& watched)
  {
    ++watched.written;
    if (watched.fails)
      throw std::runtime_error("cannot be written");
    return out << "watched";
  }
};

}

TEST(Log, PutsArgumentsInTheirPlacesWhateverTheirTypeAndOrder)
{
  LogCapture log;
  Log(systemLog, ESeverity::Info, "%2% before %1%, %3%", 7, "text", true);
  EXPECT_THAT(log.messages, ElementsAre("text before 7, true"));
}

TEST(Log, ReplacesAMessageThatCannotBeFormatted)
{
  LogCapture log;
  int written = 0;
  Log(systemLog, ESeverity::Info, "%1% and %2%", "one only");
  Log(systemLog, ESeverity::Info, "%1%", "one", "too many");
  Log(systemLog, ESeverity::Info, "%1%", Watched{written, true});
  EXPECT_THAT(log.messages, ElementsAre("Cannot Format Log Message \"%1% and %2%\"",
                                        "Cannot Format Log Message \"%1%\"", "Cannot Format Log Message \"%1%\""));
}

TEST(Log, FormatsNothingBelowTheLevel)
{
  LogCapture log;
  NMX::GlobalLog::SetLevel(ESeverity::Warning);
  int written = 0;
  Log(systemLog, ESeverity::Notice, "%1%", Watched{written});
  Log(systemLog, ESeverity::Warning, "%1%", Watched{written});
  EXPECT_EQ(written, 1);
  EXPECT_THAT(log.messages, ElementsAre("watched"));
}

TEST(Log, ShowsATextSoThatItCannotActOnTheTerminal)
{
  using LoggingDetail::PrintableText;
  const struct
  {
    std::string_view text, shown;
  } cases[]{
      {"", ""},
      {"plain \\, größer, 箱, 🎭", "plain \\, größer, 箱, 🎭"},
      {"a\nb\tc\rd", "a\\nb\\tc\\rd"},
      {std::string_view("\0\x1b[2J\x7f", 6), "\\x00\\x1b[2J\\x7f"},
      {"\u0080 \u009b31m \u009f \u00a0", "\\u{80} \\u{9b}31m \\u{9f} \u00a0"},
      {"\u202a\u202e \u2066\u2069 \u200b\u061c", "\\u{202a}\\u{202e} \\u{2066}\\u{2069} \\u{200b}\\u{61c}"},
      {"\u2028\u2029", "\\u{2028}\\u{2029}"},
      {"\x9b x \xff", "\\x9b x \\xff"},                        // bytes that begin nothing
      {"a\xc3", "a\\xc3"},                                     // the end of the text in a character
      {"\xe2\x82z \xc3(", "\\xe2\\x82z \\xc3("},               // another character in one
      {"\xc0\xaf \xed\xa0\x80", "\\xc0\\xaf \\xed\\xa0\\x80"}, // overlong; half of a pair
  };
  for (const auto& [text, shown] : cases)
    EXPECT_EQ(PrintableText(text, 100), shown);
}

TEST(Log, CutsATextAtACharacterAndSaysHowLongItIs)
{
  using LoggingDetail::PrintableText;
  EXPECT_EQ(PrintableText("12345", 5), "12345");
  EXPECT_EQ(PrintableText("123456", 5), "12345… (6 bytes in all)");
  EXPECT_EQ(PrintableText("1234ö", 5), "1234… (6 bytes in all)");
  EXPECT_EQ(PrintableText("123\x1b", 5), "123… (4 bytes in all)");
  EXPECT_EQ(PrintableText(std::string(1 << 20, 'x'), 3), "xxx… (1048576 bytes in all)");
}
