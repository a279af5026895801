#pragma once

#include <QList>
#include <QObject>
#include <QRect>
#include <QSettings>

#include <filesystem>
#include <memory>
#include <optional>

namespace Window
{

/// Where a window can be that was at `kept` when it was closed last: there, if enough of its title can be seen to move
/// it, else in the middle of the first of the `screens` (their usable areas; at least one). Never larger than a screen.
[[nodiscard]] QRect SaneGeometry(const QRect& kept, const QList<QRect>& screens);

/// How the user has arranged the window, kept in the file "window.ini" of the data folder, as long as that folder is
/// there. Whatever that file holds, the values are usable. [gui]
class VWindowSettings final : public QObject
{
  Q_OBJECT
  /// A value of the theme's Scheme: 0 as the system has it, 1 light, 2 dark.
  Q_PROPERTY(int theme READ Theme WRITE SetTheme NOTIFY themeChanged)
  Q_PROPERTY(bool logVisible READ LogVisible WRITE SetLogVisible NOTIFY logVisibleChanged)
  /// In device-independent pixels.
  Q_PROPERTY(int logHeight READ LogHeight WRITE SetLogHeight NOTIFY logHeightChanged)

public:
  /// Without a folder, nothing is kept.
  explicit VWindowSettings(const std::optional<std::filesystem::path>& dataFolder, QObject* parent = nullptr);

  [[nodiscard]] int Theme() const { return m_theme; }
  [[nodiscard]] bool LogVisible() const { return m_logVisible; }
  [[nodiscard]] int LogHeight() const { return m_logHeight; }
  void SetTheme(int theme);
  void SetLogVisible(bool visible);
  void SetLogHeight(int height);

  /// Where the window is while it is not maximised; empty when that is not known. It may be anywhere.
  [[nodiscard]] QRect Geometry() const { return m_geometry; }
  [[nodiscard]] bool Maximised() const { return m_maximised; }
  void SetGeometry(const QRect& geometry);
  void SetMaximised(bool maximised);

Q_SIGNALS:
  void themeChanged();
  void logVisibleChanged();
  void logHeightChanged();

private:
  void Read();
  [[nodiscard]] int Number(const QString& key, int least, int most, int fallback) const;
  void Keep(const QString& key, const QVariant& value);

  std::unique_ptr<QSettings> m_file; // none when nothing is kept
  int m_theme = 0;
  bool m_logVisible = false;
  int m_logHeight = 180;
  QRect m_geometry;
  bool m_maximised = false;
};

}
