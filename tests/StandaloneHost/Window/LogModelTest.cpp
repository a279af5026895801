#include "StandaloneHost/Window/LogFeed.h"
#include "StandaloneHost/Window/VLogFilterModel.h"
#include "tests/Support/Eventually.h"

#include <QAbstractItemModelTester>
#include <QCoreApplication>
#include <QSignalSpy>

#include <gmock/gmock.h>

#include <thread>

using NMX::ESeverity;
using testing::ElementsAre;
using testing::IsEmpty;
using Window::VLogFilterModel;
using Window::VLogModel;

namespace
{

using Texts = std::vector<std::string>;

class LogModel : public testing::Test
{
protected:
  void Log(const std::string& text, ESeverity severity = ESeverity::Notice, std::string_view channel = "System")
  {
    model.Append({channel, severity, text, __FILE__, __LINE__});
  }

  static Texts TextsOf(const QAbstractItemModel& shown)
  {
    Texts texts;
    for (int row = 0; row < shown.rowCount(); ++row)
      texts.push_back(shown.index(row, 0).data(VLogModel::Text).toString().toStdString());
    return texts;
  }

  static void RunEventLoop() { QCoreApplication::processEvents(); }

  int argumentCount = 0;
  QCoreApplication application{argumentCount, nullptr};
  VLogModel model;
  VLogFilterModel filter{model};
  QAbstractItemModelTester modelTester{&model, QAbstractItemModelTester::FailureReportingMode::Fatal};
  QAbstractItemModelTester filterTester{&filter, QAbstractItemModelTester::FailureReportingMode::Fatal};
};

}

TEST_F(LogModel, ShowsMessagesOnceTheEventLoopRuns)
{
  Log("first");
  Log("größer", ESeverity::Error, "Server");
  EXPECT_THAT(TextsOf(model), IsEmpty());
  RunEventLoop();
  EXPECT_THAT(TextsOf(model), ElementsAre("first", "größer"));
  const QModelIndex second = model.index(1, 0);
  EXPECT_EQ(second.data(VLogModel::SeverityName), "error");
  EXPECT_EQ(second.data(VLogModel::Channel), "Server");
  Log("third");
  RunEventLoop();
  EXPECT_THAT(TextsOf(model), ElementsAre("first", "größer", "third"));
}

TEST_F(LogModel, KeepsTheNewestMessagesButCountsAll)
{
  constexpr int capacity = static_cast<int>(VLogModel::capacity);
  QSignalSpy counts(&model, &VLogModel::countsChanged);
  Log("a warning that is pushed out", ESeverity::Warning);
  RunEventLoop();
  for (int i = 0; i < capacity - 1; ++i)
    Log(std::to_string(i));
  RunEventLoop();
  EXPECT_EQ(model.rowCount(), capacity);
  Log("newest", ESeverity::Critical);
  RunEventLoop();
  EXPECT_EQ(model.rowCount(), capacity);
  EXPECT_EQ(TextsOf(model).front(), "0");
  EXPECT_EQ(TextsOf(model).back(), "newest");

  // A burst of more than there is room for, between two turns of the event loop
  for (int i = 0; i < 2 * capacity; ++i)
    Log("burst " + std::to_string(i), ESeverity::Error);
  RunEventLoop();
  EXPECT_EQ(model.rowCount(), capacity);
  EXPECT_EQ(TextsOf(model).front(), "burst " + std::to_string(capacity));
  EXPECT_EQ(model.Warnings(), 1);
  EXPECT_EQ(model.Errors(), 1 + 2 * capacity);
  EXPECT_EQ(counts.count(), 3);
}

TEST_F(LogModel, TakesMessagesFromManyThreadsEachInItsOrder)
{
  constexpr int threads = 4;
  constexpr int each = 500;
  std::vector<std::jthread> loggers;
  for (int thread = 0; thread < threads; ++thread)
    loggers.emplace_back(
        [this, channel = "Channel " + std::to_string(thread)]
        {
          for (int i = 0; i < each; ++i)
            Log(std::to_string(i), ESeverity::Info, channel);
        });
  EXPECT_TRUE(Eventually([&] { return model.rowCount() >= threads * each; }, RunEventLoop));
  loggers.clear();
  EXPECT_EQ(model.Channels(), QStringList({"Channel 0", "Channel 1", "Channel 2", "Channel 3"}));
  Texts expected;
  for (int i = 0; i < each; ++i)
    expected.push_back(std::to_string(i));
  filter.SetChannel("Channel 2");
  EXPECT_EQ(TextsOf(filter), expected);
}

TEST_F(LogModel, FiltersByChannelAndSeverityAlsoWhatComesLater)
{
  Log("start");
  Log("refused", ESeverity::Warning, "Server");
  Log("broken", ESeverity::Critical, "Server");
  RunEventLoop();
  filter.SetSeverity(static_cast<int>(ESeverity::Warning));
  EXPECT_THAT(TextsOf(filter), ElementsAre("refused", "broken"));
  filter.SetChannel("System");
  EXPECT_THAT(TextsOf(filter), IsEmpty());
  Log("full", ESeverity::Error);
  RunEventLoop();
  EXPECT_THAT(TextsOf(filter), ElementsAre("full"));
  filter.SetChannel({});
  filter.SetSeverity(static_cast<int>(ESeverity::Trace));
  EXPECT_THAT(TextsOf(filter), ElementsAre("start", "refused", "broken", "full"));
}

TEST_F(LogModel, CopiesLinesAndLeavesOutRowsThatAreNotThere)
{
  Log("one");
  Log("100 %1 two", ESeverity::Warning, "%2");
  RunEventLoop();
  const QString line = filter.lines(1, 1);
  EXPECT_TRUE(line.endsWith(" warning [%2] 100 %1 two\n")) << line.toStdString();
  EXPECT_EQ(filter.lines(-5, 99).count('\n'), 2);
  EXPECT_EQ(filter.lines(1, 0), "");
}

TEST_F(LogModel, IsFedByTheWriterOfTheLogWithWhatItWrites)
{
  Logging::LogWriter writer(-1);
  {
    const Window::LogFeed feed(writer, model);
    NMX::Log(NMX::systemLog, ESeverity::Notice, "%1%", "both\u202e" + std::string(1 << 20, 'x'));
    // As many as would push everything else out
    for (int i = 0; i < 100000; ++i)
      NMX::Log(NMX::systemLog, ESeverity::Notice, "%1%", i);
  }
  NMX::Log(NMX::systemLog, ESeverity::Notice, "one");
  RunEventLoop();
  ASSERT_GT(model.rowCount(), 100);
  EXPECT_LT(model.rowCount(), 1000);
  const std::string first = TextsOf(model).front();
  EXPECT_TRUE(first.starts_with("both\\u{202e}xxx")) << first.substr(0, 20);
  EXPECT_LT(first.size(), 3000U);
  EXPECT_NE(TextsOf(model).back(), "one");
}
