#include "StandaloneHost/Window/VWindowSettings.h"

#include <QDir>
#include <QFileInfo>

#include <algorithm>

namespace Window
{

namespace
{

constexpr QSize usualSize(1180, 780);
constexpr QSize leastSize(480, 320);
constexpr int farthest = 32767; // no screen is farther away
constexpr int highestLog = 4000;
constexpr QSize grip(120, 20); // so much of the title has to be seen

bool CanBeGripped(const QRect& window, const QList<QRect>& screens)
{
  const QRect title(window.topLeft(), QSize(window.width(), grip.height()));
  return std::any_of(screens.begin(), screens.end(),
                     [&](const QRect& screen)
                     {
                       const QRect seen = title.intersected(screen);
                       return seen.width() >= grip.width() && seen.height() >= grip.height() / 2;
                     });
}

}

QRect SaneGeometry(const QRect& kept, const QList<QRect>& screens)
{
  const bool known = kept.width() >= leastSize.width() && kept.height() >= leastSize.height();
  QSize largest;
  for (const QRect& screen : screens)
    largest = largest.expandedTo(screen.size());
  const QRect wanted(kept.topLeft(), (known ? kept.size() : usualSize).boundedTo(largest));
  if (known && CanBeGripped(wanted, screens))
    return wanted;
  QRect centred({}, wanted.size().boundedTo(screens.first().size()));
  centred.moveCenter(screens.first().center());
  return centred;
}

VWindowSettings::VWindowSettings(const std::optional<std::filesystem::path>& dataFolder, QObject* parent)
    : QObject(parent)
{
  if (!dataFolder)
    return;
  m_file =
      std::make_unique<QSettings>(QString::fromStdString((*dataFolder / "window.ini").string()), QSettings::IniFormat);
  Read();
}

void VWindowSettings::Read()
{
  m_theme = Number("theme", 0, 2, m_theme);
  m_logVisible = Number("log/visible", 0, 1, 0) == 1;
  m_logHeight = Number("log/height", 40, highestLog, m_logHeight);
  m_maximised = Number("window/maximised", 0, 1, 0) == 1;
  const int width = Number("window/width", leastSize.width(), farthest, 0);
  const int height = Number("window/height", leastSize.height(), farthest, 0);
  if (width > 0 && height > 0)
    m_geometry =
        QRect(Number("window/x", -farthest, farthest, 0), Number("window/y", -farthest, farthest, 0), width, height);
}

int VWindowSettings::Number(const QString& key, int least, int most, int fallback) const
{
  bool isNumber = false;
  const int number = m_file->value(key).toInt(&isNumber);
  return isNumber && number >= least && number <= most ? number : fallback;
}

void VWindowSettings::Keep(const QString& key, const QVariant& value)
{
  // The file would make the folder anew, which may be on a disk that is not there at the moment.
  if (m_file && QFileInfo(m_file->fileName()).dir().exists())
    m_file->setValue(key, value);
}

void VWindowSettings::SetTheme(int theme)
{
  if (theme == m_theme)
    return;
  m_theme = theme;
  Keep("theme", theme);
  Q_EMIT themeChanged();
}

void VWindowSettings::SetLogVisible(bool visible)
{
  if (visible == m_logVisible)
    return;
  m_logVisible = visible;
  Keep("log/visible", visible ? 1 : 0);
  Q_EMIT logVisibleChanged();
}

void VWindowSettings::SetLogHeight(int height)
{
  if (height == m_logHeight)
    return;
  m_logHeight = height;
  Keep("log/height", height);
  Q_EMIT logHeightChanged();
}

void VWindowSettings::SetGeometry(const QRect& geometry)
{
  m_geometry = geometry;
  Keep("window/x", geometry.x());
  Keep("window/y", geometry.y());
  Keep("window/width", geometry.width());
  Keep("window/height", geometry.height());
}

void VWindowSettings::SetMaximised(bool maximised)
{
  m_maximised = maximised;
  Keep("window/maximised", maximised ? 1 : 0);
}

}
