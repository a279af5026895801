#include "StandaloneHost/Window/VCommandMenus.h"

#include <algorithm>
#include <utility>

namespace Window
{

namespace
{

QString NameOf(QString title)
{
  return title.remove('&');
}

}

VCommand::VCommand(RunaCorePluginInterface::MenuCommand command, QObject* parent)
    : QObject(parent), m_command(std::move(command))
{
}

QString VCommand::Text() const
{
  return QString::fromStdString(m_command.text);
}

QString VCommand::Shortcut() const
{
  return QString::fromStdString(m_command.shortcut);
}

QString VCommand::ToolTip() const
{
  return QString::fromStdString(m_command.toolTip);
}

void VCommand::ask()
{
  std::string reason;
  const bool possible = !m_command.possible || m_command.possible(reason);
  const QString text = possible ? QString{} : QString::fromStdString(reason);
  if (possible == m_possible && text == m_reason)
    return;
  m_possible = possible;
  m_reason = text;
  Q_EMIT possibleChanged();
}

QString VCommand::trigger()
{
  ask();
  if (!m_possible)
    return m_reason.isEmpty() ? "This is not possible now." : m_reason;
  if (!m_command.trigger)
    return {};
  std::string reason;
  const NMX::IResult result = m_command.trigger(reason);
  if (result.Succeeded())
    return {};
  return QString::fromStdString(reason.empty() ? std::string(result.Name()) : reason);
}

void VCommandMenus::Add(RunaCorePluginInterface::MenuCommand command)
{
  const QString title = QString::fromStdString(command.menu);
  auto menu = std::find_if(m_menus.begin(), m_menus.end(),
                           [name = NameOf(title)](const Menu& present) { return NameOf(present.title) == name; });
  if (menu == m_menus.end())
    menu = m_menus.insert(menu, {title, {}});
  menu->commands.append(new VCommand(std::move(command), this));
}

QObjectList VCommandMenus::commandsOf(const QString& menu) const
{
  for (const Menu& present : m_menus)
    if (NameOf(present.title) == NameOf(menu))
      return present.commands;
  return {};
}

QStringList VCommandMenus::titlesBeside(const QStringList& own) const
{
  QStringList titles;
  for (const Menu& menu : m_menus)
    if (!own.contains(NameOf(menu.title)))
      titles.append(menu.title);
  return titles;
}

}
