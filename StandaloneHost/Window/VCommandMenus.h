#pragma once

#include "HostInterface/RunaCorePluginInterface/IUserInterface.h"

#include <QColor>
#include <QObject>
#include <QStringList>

#include <vector>

namespace Window
{

/// A plugin's command as a menu shows it. [gui]
class VCommand final : public QObject
{
  Q_OBJECT
  Q_PROPERTY(QString text READ Text CONSTANT)
  /// Empty for none.
  Q_PROPERTY(QString shortcut READ Shortcut CONSTANT)
  Q_PROPERTY(QString toolTip READ ToolTip CONSTANT)
  /// Transparent for a command without an icon.
  Q_PROPERTY(QColor colour READ Colour CONSTANT)
  /// As it was when it was asked last.
  Q_PROPERTY(bool possible READ Possible NOTIFY possibleChanged)
  /// Why it is not possible; empty when it is.
  Q_PROPERTY(QString reason READ Reason NOTIFY possibleChanged)

public:
  explicit VCommand(RunaCorePluginInterface::MenuCommand command, QObject* parent = nullptr);

  [[nodiscard]] QString Text() const;
  [[nodiscard]] QString Shortcut() const;
  [[nodiscard]] QString ToolTip() const;
  [[nodiscard]] QColor Colour() const { return QColor::fromRgba(m_command.colour); }
  [[nodiscard]] bool Possible() const { return m_possible; }
  [[nodiscard]] QString Reason() const { return m_reason; }

  /// Asks the plugin whether the command can be triggered now.
  Q_INVOKABLE void ask();

  /// Does it, if it can be done now. Answers why it failed, for people; an empty text when it did not.
  Q_INVOKABLE [[nodiscard]] QString trigger();

Q_SIGNALS:
  void possibleChanged();

private:
  const RunaCorePluginInterface::MenuCommand m_command;
  bool m_possible = true;
  QString m_reason;
};

/// The commands that plugins add, by menu. Menus whose names differ only in what opens them are one. [gui]
class VCommandMenus final : public QObject
{
  Q_OBJECT

public:
  using QObject::QObject;

  void Add(RunaCorePluginInterface::MenuCommand command);

  /// The commands (VCommand) of a menu, which is named without "&", in the order in which they were added.
  Q_INVOKABLE [[nodiscard]] QObjectList commandsOf(const QString& menu) const;

  /// The titles of the menus that are not among `own`, in the order in which they were first named.
  Q_INVOKABLE [[nodiscard]] QStringList titlesBeside(const QStringList& own) const;

private:
  struct Menu
  {
    QString title;
    QObjectList commands;
  };

  std::vector<Menu> m_menus;
};

}
