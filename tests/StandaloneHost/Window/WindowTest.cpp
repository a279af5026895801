#include "StandaloneHost/Postal/VAsioPostalService.h"
#include "StandaloneHost/Window/VWindow.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/TemporaryFolder.h"

#include <QColor>
#include <QGuiApplication>
#include <QQmlComponent>
#include <QQmlContext>
#include <QQmlEngine>
#include <QSignalSpy>
#include <QTest>
#include <QTimer>
#include <QWindow>

#include <gmock/gmock.h>

#include <functional>
#include <string>
#include <utility>

using RunaCorePluginInterface::MenuCommand;
using testing::ElementsAre;
using testing::IsEmpty;

namespace
{

LogCapture* complaints = nullptr;

/// A window over a server that is open, on a display that nobody sees. What Qt complains of fails the test.
class WindowTest : public testing::Test
{
protected:
  // Qt cannot open a second display after the first.
  static void SetUpTestSuite()
  {
    qputenv("QT_QPA_PLATFORM", "offscreen");
    qputenv("QT_QUICK_BACKEND", "software");
    static int argumentCount = 1;
    static char name[] = "test";
    static char* arguments[] = {name, nullptr};
    application = std::make_unique<QGuiApplication>(argumentCount, arguments);
  }

  static void TearDownTestSuite() { application.reset(); }

  WindowTest()
  {
    complaints = &log;
    qInstallMessageHandler([](QtMsgType, const QMessageLogContext&, const QString& text)
                           { complaints->messages.push_back(text.toStdString()); });
    server->Open();
    Restart();
  }

  ~WindowTest() override
  {
    window.reset();
    EXPECT_THAT(log.messages, IsEmpty());
    server->Close();
    postal->Stop();
    qInstallMessageHandler(nullptr);
  }

  void Restart()
  {
    window.reset();
    window = std::make_unique<Window::VWindow>(model, folder.Path());
  }

  QWindow& Show(bool canClose = true, std::function<std::string()> storeFault = {})
  {
    window->Show(*server, [canClose] { return canClose; }, std::move(storeFault));
    QWindow* shown = QGuiApplication::topLevelWindows().first();
    EXPECT_TRUE(QTest::qWaitForWindowExposed(shown));
    return *shown;
  }

  /// A command that writes down that it was triggered.
  void AddCommand(const std::string& menu, const std::string& shortcut, bool possible = true)
  {
    MenuCommand command;
    command.menu = menu;
    command.text = shortcut;
    command.shortcut = shortcut;
    command.possible = [possible](std::string& reason)
    {
      reason = "Not now.";
      return possible;
    };
    command.trigger = [this, shortcut](std::string&)
    {
      triggered.push_back(shortcut);
      return NMX::EResult::Ok;
    };
    window->AddCommand(std::move(command));
  }

  static inline std::unique_ptr<QGuiApplication> application;
  LogCapture log;
  TemporaryFolder folder;
  std::shared_ptr<Postal::VAsioPostalService> postal = NMX::MakeShared<Postal::VAsioPostalService>();
  std::shared_ptr<Server::VServer> server = NMX::MakeShared<Server::VServer>(
      postal, Server::ServerOptions{.port = 0, .token = {}, .allowedOrigins = {}, .limits = {}});
  Window::VLogModel model;
  std::unique_ptr<Window::VWindow> window;
  std::vector<std::string> triggered;
};

}

TEST_F(WindowTest, AnswersColoursOfTheThemeByName)
{
  EXPECT_EQ(window->ThemeColour("highlightedText"), 0xFFFFFFFFU);
  EXPECT_NE(window->ThemeColour("critical"), window->ThemeColour("good"));
  for (const char* notAColour : {"", "nonsense", "spacing", "dark"})
    EXPECT_EQ(window->ThemeColour(notAColour), 0xFF808080U) << notAColour;
}

TEST_F(WindowTest, TriggersCommandsByTheirKeysIfTheyArePossible)
{
  AddCommand("&Edit", "Ctrl+Shift+P");
  AddCommand("&Stage", "Ctrl+R");
  AddCommand("Edit", "Ctrl+M", false);
  QWindow& shown = Show();
  QTest::keyClick(&shown, Qt::Key_P, Qt::ControlModifier | Qt::ShiftModifier);
  QTest::keyClick(&shown, Qt::Key_R, Qt::ControlModifier);
  QTest::keyClick(&shown, Qt::Key_M, Qt::ControlModifier);
  EXPECT_THAT(triggered, ElementsAre("Ctrl+Shift+P", "Ctrl+R"));
}

TEST_F(WindowTest, WarnsForAsLongAsEditsCannotBeKept)
{
  std::string fault;
  QWindow& shown = Show(true, [&fault] { return fault; });
  const auto* warning = shown.findChild<QObject*>("storeFault");
  ASSERT_NE(warning, nullptr);
  const auto told = [warning] { return warning->property("visible").toBool(); };
  EXPECT_FALSE(told());
  fault = "the disk is full";
  EXPECT_TRUE(QTest::qWaitFor(told, 5000));
  EXPECT_TRUE(warning->property("explanation").toString().contains("the disk is full"));
  fault.clear();
  EXPECT_TRUE(QTest::qWaitFor([&] { return !told(); }, 5000));
}

TEST_F(WindowTest, EndsTheEventLoopByItsKeysUnlessThatIsRefused)
{
  const auto quit = [](QWindow& shown)
  {
    QTimer::singleShot(0, &shown, [&shown] { QTest::keyClick(&shown, Qt::Key_Q, Qt::ControlModifier); });
    QTimer::singleShot(500, &shown, [&shown] { QCoreApplication::exit(shown.isVisible() ? 1 : 2); });
    return QGuiApplication::exec();
  };
  EXPECT_EQ(quit(Show(false)), 1);
  Restart();
  EXPECT_EQ(quit(Show(true)), 0);
}

TEST_F(WindowTest, KeepsItsPlaceAndWhetherTheLogIsShown)
{
  QWindow& shown = Show();
  QTest::keyClick(&shown, Qt::Key_L, Qt::ControlModifier);
  const QRect place(60, 70, 640, 420);
  shown.setGeometry(place);
  QTest::qWait(1);
  Restart();
  EXPECT_EQ(Show().geometry(), place);
  EXPECT_TRUE(window->Settings()->property("logVisible").toBool());
}

TEST_F(WindowTest, AsksBeforeTheStageIsReplacedAndTellsOfAFailureAfterwards)
{
  QQmlComponent component(&window->Engine());
  component.setData(R"(import QtQml
QtObject {
  property int count: 0
  property string loaded
  function subjects() { return Array(count).fill(0) }
  function loadSubjectConfiguration(file) {
    loaded += file
    return { failed: true, name: "FileNotFound", reason: "There is no such file." }
  }
})",
                    {});
  const std::unique_ptr<QObject> store(component.create());
  window->RootContext().setContextProperty("rootContextSubjectStore", store.get());
  QWindow& shown = Show();
  auto* files = shown.findChild<QObject*>("files");
  auto* box = shown.findChild<QObject*>("messageBox");
  const auto load = [&] { QMetaObject::invokeMethod(files, "loadFrom", Q_ARG(QUrl, QUrl("file:///stage.xml"))); };
  const auto says = [&](const char* text)
  {
    return QTest::qWaitFor(
        [&] { return box->property("text").toString().contains(text) && box->property("opened").toBool(); });
  };

  load();
  EXPECT_TRUE(says("no such file")) << "nothing is replaced, so nothing is asked";
  EXPECT_EQ(store->property("loaded"), "file:///stage.xml");
  QTest::keyClick(&shown, Qt::Key_Escape);
  EXPECT_TRUE(QTest::qWaitFor([&] { return !box->property("visible").toBool(); }));

  store->setProperty("loaded", "");
  store->setProperty("count", 2);
  load();
  EXPECT_TRUE(says("2 subjects"));
  QTest::keyClick(&shown, Qt::Key_Return); // what stands ready is to cancel
  EXPECT_TRUE(QTest::qWaitFor([&] { return !box->property("visible").toBool(); }));
  EXPECT_EQ(store->property("loaded"), "");

  load();
  EXPECT_TRUE(says("2 subjects"));
  QMetaObject::invokeMethod(box, "accept");
  EXPECT_TRUE(says("no such file"));
  EXPECT_EQ(store->property("loaded"), "file:///stage.xml");
  window.reset();
}

TEST_F(WindowTest, IsGoneBeforeTheObjectsOfAPlugin)
{
  QObject published;
  window->RootContext().setContextProperty("rootContextSubjectStore", &published);
  Show();
  EXPECT_EQ(window->Store(), &published);
  QSignalSpy engineGone(&window->Engine(), &QObject::destroyed);
  window.reset();
  EXPECT_EQ(engineGone.count(), 1);
}
