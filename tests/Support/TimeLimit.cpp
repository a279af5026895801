// Ends the program when one of its tests takes too long, and says which: a thread that waits for another one for ever
// can be ended in no other way.

#include <gtest/gtest.h>

#include <csignal>
#include <cstdlib>
#include <string>

#include <unistd.h>

namespace
{
constexpr unsigned longestTest = 280; // s; sooner than ctest, which does not know what hangs

std::string message;

void End(int)
{
  (void)!write(STDERR_FILENO, message.data(), message.size());
  std::_Exit(EXIT_FAILURE);
}

class TimeLimit final : public testing::EmptyTestEventListener
{
  void OnTestStart(const testing::TestInfo& test) override
  {
    message = std::string("Not within ") + std::to_string(longestTest) + " s: the end of " + test.test_suite_name() +
              '.' + test.name() + '\n';
    (void)std::signal(SIGALRM, End);
    alarm(longestTest);
  }

  void OnTestEnd(const testing::TestInfo&) override { alarm(0); }
};

[[maybe_unused]] const bool isSet = []
{
  testing::UnitTest::GetInstance()->listeners().Append(new TimeLimit);
  return true;
}();
} // namespace
