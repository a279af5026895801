#include "StandaloneHost/Window/VWindowSettings.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>

#include <filesystem>
#include <fstream>
#include <ostream>

using Window::SaneGeometry;
using Window::VWindowSettings;

void PrintTo(const QRect& rectangle, std::ostream* out)
{
  *out << rectangle.x() << ',' << rectangle.y() << ' ' << rectangle.width() << 'x' << rectangle.height();
}

namespace
{

const QRect left(0, 0, 1920, 1040);
const QRect right(1920, 200, 1280, 800);

}

TEST(WindowSettings, KeepsAWindowWhereItsTitleCanBeReached)
{
  for (const QRect& kept : {QRect(100, 100, 1000, 700), QRect(1700, 300, 800, 600), QRect(-600, 20, 800, 600),
                            QRect(1900, 250, 1200, 700), QRect(100, 1000, 900, 700)})
    EXPECT_EQ(SaneGeometry(kept, {left, right}), kept);
}

TEST(WindowSettings, BringsBackAWindowThatCouldNotBeReached)
{
  const QRect lost[] = {{},
                        {100, 100, 10, 10},
                        {5000, 100, 1000, 700}, // a screen that is gone
                        {100, -300, 1000, 700}, // its title is above all screens
                        {1990, 20, 1000, 700},  // likewise, above the lower one
                        {-980, 100, 1000, 700}, // hardly any of it can be seen
                        {100, 1035, 1000, 700},
                        {-32767, -32767, 32767, 32767}};
  for (const QRect& kept : lost)
  {
    const QRect geometry = SaneGeometry(kept, {left, right});
    EXPECT_TRUE(left.contains(geometry)) << testing::PrintToString(kept) << " -> " << testing::PrintToString(geometry);
    EXPECT_GE(geometry.width(), 480);
    EXPECT_LE((geometry.center() - left.center()).manhattanLength(), 2);
  }
  EXPECT_EQ(SaneGeometry({}, {QRect(0, 0, 640, 400)}), QRect(0, 0, 640, 400));
  EXPECT_EQ(SaneGeometry({10, 10, 9000, 9000}, {left, right}).size(), left.size());
}

TEST(WindowSettings, SurvivesARestart)
{
  const TemporaryFolder folder;
  {
    VWindowSettings settings(folder.Path());
    settings.SetTheme(2);
    settings.SetLogVisible(true);
    settings.SetLogHeight(333);
    settings.SetGeometry({-5, 7, 900, 600});
    settings.SetMaximised(true);
  }
  const VWindowSettings settings(folder.Path());
  EXPECT_EQ(settings.Theme(), 2);
  EXPECT_TRUE(settings.LogVisible());
  EXPECT_EQ(settings.LogHeight(), 333);
  EXPECT_EQ(settings.Geometry(), QRect(-5, 7, 900, 600));
  EXPECT_TRUE(settings.Maximised());
}

TEST(WindowSettings, DoesNotMakeAFolderThatIsGone)
{
  const TemporaryFolder folder;
  {
    VWindowSettings settings(folder.Path() / "data");
    settings.SetTheme(2);
    settings.SetGeometry({-5, 7, 900, 600});
  }
  EXPECT_TRUE(std::filesystem::is_empty(folder.Path()));
}

TEST(WindowSettings, TakesNothingFromAFileThatMakesNoSense)
{
  const std::string nonsense[] = {
      {"\0\xff\xfe]][[=\n=\n%%%\x01", 15},
      "theme=7\n[log]\nvisible=maybe\nheight=-3\n[window]\nwidth=1e9\nheight=99999999999\nmaximised=2\n",
      "theme=@Invalid()\n[log]\nheight=@Rect(1 2 3 4)\n[window]\nx=1\ny=2\nwidth=900\nheight=3\n",
  };
  const VWindowSettings usual(std::nullopt);
  for (const std::string& text : nonsense)
  {
    const TemporaryFolder folder;
    std::ofstream(folder.Path() / "window.ini") << text;
    VWindowSettings settings(folder.Path());
    EXPECT_EQ(settings.Theme(), usual.Theme()) << text;
    EXPECT_EQ(settings.LogVisible(), usual.LogVisible()) << text;
    EXPECT_EQ(settings.LogHeight(), usual.LogHeight()) << text;
    EXPECT_EQ(settings.Geometry(), usual.Geometry()) << text;
    EXPECT_EQ(settings.Maximised(), usual.Maximised()) << text;
    settings.SetTheme(1);
    EXPECT_EQ(settings.Theme(), 1);
  }
}
