#include "StandaloneHost/Window/VCommandMenus.h"

#include <QSignalSpy>

#include <gmock/gmock.h>

using RunaCorePluginInterface::MenuCommand;
using Window::VCommand;
using Window::VCommandMenus;

namespace
{

MenuCommand Named(std::string menu, std::string text)
{
  MenuCommand command;
  command.menu = std::move(menu);
  command.text = std::move(text);
  return command;
}

/// The commands of a menu "Edit" that only has what the test puts there.
class EditMenu
{
public:
  VCommand& Add(decltype(MenuCommand::possible) possible, decltype(MenuCommand::trigger) trigger)
  {
    MenuCommand command = Named("Edit", "Merge");
    command.possible = std::move(possible);
    command.trigger = std::move(trigger);
    m_menus.Add(std::move(command));
    return *qobject_cast<VCommand*>(m_menus.commandsOf("Edit").last());
  }

private:
  VCommandMenus m_menus;
};

}

TEST(CommandMenus, PutsCommandsOfMenusOfTheSameNameTogether)
{
  VCommandMenus menus;
  menus.Add(Named("&Edit", "Group"));
  menus.Add(Named("&Stage", "Reboot"));
  menus.Add(Named("Edit", "Ungroup"));
  menus.Add(Named("E&dit", "Merge"));
  menus.Add(Named("Tools", "Measure"));
  QStringList texts;
  for (const QObject* command : menus.commandsOf("Edit"))
    texts.append(command->property("text").toString());
  EXPECT_EQ(texts, QStringList({"Group", "Ungroup", "Merge"}));
  EXPECT_TRUE(menus.commandsOf("File").isEmpty());
  EXPECT_EQ(menus.titlesBeside({"File", "Edit"}), QStringList({"&Stage", "Tools"}));
}

TEST(CommandMenus, AsksWhetherACommandIsPossibleEachTime)
{
  EditMenu menu;
  std::string obstacle;
  int done = 0;
  VCommand& command = menu.Add(
      [&](std::string& reason)
      {
        reason = obstacle.empty() ? "not to be shown" : obstacle;
        return obstacle.empty();
      },
      [&](std::string& /*reason*/)
      {
        ++done;
        return NMX::EResult::Ok;
      });
  QSignalSpy changes(&command, &VCommand::possibleChanged);
  command.ask();
  EXPECT_TRUE(command.Possible());
  EXPECT_EQ(command.Reason(), "");
  EXPECT_EQ(changes.count(), 0);

  obstacle = "Nothing is selected.";
  command.ask();
  command.ask();
  EXPECT_FALSE(command.Possible());
  EXPECT_EQ(command.Reason(), "Nothing is selected.");
  EXPECT_EQ(changes.count(), 1);

  // Its keys reach it although nobody has asked since.
  obstacle = "Only one is selected.";
  EXPECT_EQ(command.trigger(), "Only one is selected.");
  EXPECT_EQ(done, 0);
  obstacle.clear();
  EXPECT_EQ(command.trigger(), "");
  EXPECT_EQ(done, 1);
}

TEST(CommandMenus, AlwaysHasWordsForAFailure)
{
  EditMenu menu;
  const auto full = [](std::string& reason)
  {
    reason = "There is no room left.";
    return NMX::EResult::DiskFull;
  };
  EXPECT_EQ(menu.Add({}, full).trigger(), "There is no room left.");
  EXPECT_EQ(menu.Add({}, [](std::string&) { return NMX::EResult::DiskFull; }).trigger(), "DiskFull");
  EXPECT_NE(menu.Add([](std::string&) { return false; }, full).trigger(), "");
  EXPECT_EQ(menu.Add({}, {}).trigger(), "");
}
