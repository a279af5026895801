#include "StandaloneHost/Window/VWindow.h"

#include "HostInterface/RunaCorePluginInterface/IPlugin.h"

#include <QClipboard>
#include <QColor>
#include <QFile>
#include <QGuiApplication>
#include <QQmlApplicationEngine>
#include <QQmlComponent>
#include <QQmlContext>
#include <QScreen>
#include <QWindow>

#include <chrono>
#include <utility>

namespace Window
{

namespace
{

const QString ownFolder = "qrc:/StandaloneHost/Window/";
const QString panelFile = "/qml/Tavix/SubjectStore/Panel/SubjectPanel.qml";
constexpr QRgb unknownColour = 0xFF808080;

}

VWindow::VWindow(VLogModel& log, const std::optional<std::filesystem::path>& dataFolder)
    : m_log(log), m_filteredLog(log), m_settings(dataFolder), m_engine(std::make_unique<QQmlApplicationEngine>())
{
  // The path that is added last is looked at first: what a plugin brings hides what stands in for it.
  m_engine->addImportPath(ownFolder + "Fallback");
  m_engine->addImportPath("qrc:/qml");
  m_moved.setSingleShot(true);
  m_moved.setInterval(std::chrono::milliseconds(300));
  connect(&m_moved, &QTimer::timeout, this, &VWindow::KeepPlace);
}

VWindow::~VWindow()
{
  if (m_moved.isActive())
    KeepPlace();
}

QQmlEngine& VWindow::Engine() const
{
  return *m_engine;
}

QQmlContext& VWindow::RootContext() const
{
  return *m_engine->rootContext();
}

std::uint32_t VWindow::ThemeColour(std::string_view name) const
{
  if (!m_theme)
  {
    QQmlComponent component(m_engine.get(), QUrl(ownFolder + "ThemeColours.qml"));
    m_theme.reset(component.create());
  }
  const auto* theme = m_theme ? m_theme->property("theme").value<QObject*>() : nullptr;
  const QVariant value = theme != nullptr ? theme->property(std::string(name).c_str()) : QVariant{};
  return value.typeId() == QMetaType::QColor ? value.value<QColor>().rgba() : unknownColour;
}

void VWindow::AddCommand(RunaCorePluginInterface::MenuCommand command)
{
  m_commands.Add(std::move(command));
}

void VWindow::Show(const Server::VServer& server, std::function<bool()> canClose,
                   std::function<std::string()> storeFault)
{
  m_server = std::make_unique<VServerStatus>(server, std::move(storeFault));
  m_canClose = std::move(canClose);
  m_engine->setInitialProperties({{"host", QVariant::fromValue<QObject*>(this)}});
  m_engine->load(QUrl(ownFolder + "MainWindow.qml"));
  const QObjectList roots = m_engine->rootObjects();
  m_window = roots.isEmpty() ? nullptr : qobject_cast<QWindow*>(roots.first());
  if (!m_window)
    throw WindowError("the window cannot be shown; --headless does without");
  Place();
}

void VWindow::Place()
{
  QList<QRect> screens;
  for (const QScreen* screen : QGuiApplication::screens())
    screens.append(screen->availableGeometry());
  m_window->setGeometry(SaneGeometry(m_settings.Geometry(), screens));
  m_settings.Maximised() ? m_window->showMaximized() : m_window->show();
  m_window->requestActivate();
  // A window that is being maximised changes its size before it says so: its place is looked at a little later.
  const auto moved = [this] { m_moved.start(); };
  connect(m_window, &QWindow::xChanged, this, moved);
  connect(m_window, &QWindow::yChanged, this, moved);
  connect(m_window, &QWindow::widthChanged, this, moved);
  connect(m_window, &QWindow::heightChanged, this, moved);
  connect(m_window, &QWindow::visibilityChanged, this, moved);
}

void VWindow::KeepPlace()
{
  if (!m_window)
    return;
  const QWindow::Visibility visibility = m_window->visibility();
  if (visibility == QWindow::Windowed)
    m_settings.SetGeometry(m_window->geometry());
  if (visibility == QWindow::Windowed || visibility == QWindow::Maximized)
    m_settings.SetMaximised(visibility == QWindow::Maximized);
}

bool VWindow::mayClose()
{
  if (m_canClose && !m_canClose())
    return false;
  KeepPlace();
  return true;
}

void VWindow::copy(const QString& text) const
{
  QGuiApplication::clipboard()->setText(text);
}

bool VWindow::fileExists(const QUrl& file) const
{
  return QFile::exists(file.toLocalFile());
}

QUrl VWindow::Panel() const
{
  const bool served = m_engine->rootContext()->contextProperty("rootContextSubjectPanel").isValid();
  return served && QFile::exists(':' + panelFile) ? QUrl("qrc:" + panelFile) : QUrl{};
}

QObject* VWindow::Store() const
{
  return m_engine->rootContext()->contextProperty("rootContextSubjectStore").value<QObject*>();
}

QString VWindow::Version() const
{
  return QString("Version 1.0.0 (plugin interfaces %1, Qt %2)")
      .arg(RunaCorePluginInterface::buildRevision)
      .arg(qVersion());
}

}
