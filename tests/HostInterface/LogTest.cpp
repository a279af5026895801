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
