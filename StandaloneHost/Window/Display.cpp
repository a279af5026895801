#include "StandaloneHost/Window/Display.h"

#include "HostInterface/LoggingDetail/PrintableText.h"
#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Logging/LogLine.h"
#include "StandaloneHost/Logging/StandardStreams.h"

#include <QGuiApplication>
#include <QOffscreenSurface>
#include <QOpenGLContext>
#include <QQuickStyle>
#include <QQuickWindow>
#include <QStringList>

#include <cstdlib>
#include <unistd.h>
#include <utility>

namespace Window
{

namespace
{

constexpr NMX::LogChannel qtLog{"Qt"};

NMX::ESeverity SeverityOf(QtMsgType type)
{
  switch (type)
  {
  case QtDebugMsg:
    return NMX::ESeverity::Debug;
  case QtInfoMsg:
    return NMX::ESeverity::Info;
  case QtWarningMsg:
    return NMX::ESeverity::Warning;
  case QtCriticalMsg:
    return NMX::ESeverity::Error;
  case QtFatalMsg:
    break;
  }
  return NMX::ESeverity::Fatal;
}

/// With the place in Qt's source, as far as Qt knows it.
void LogMessage(QtMsgType type, const QMessageLogContext& context, const QString& text)
{
  const NMX::ESeverity severity = SeverityOf(type);
  if (!NMX::GlobalLog::Enabled(severity))
    return;
  const std::string message = text.toStdString();
  const std::string_view file = context.file != nullptr ? context.file : "";
  NMX::GlobalLog::Write({qtLog.name, severity, message, file, static_cast<unsigned>(context.line)});
}

/// What Qt says while it opens the display.
QStringList& Remarks()
{
  static QStringList remarks;
  return remarks;
}

/// While the display is opened: Qt ends the program on its own when that fails, and what it said last tells why.
void EndWithoutDisplay(QtMsgType type, const QMessageLogContext& /*context*/, const QString& text)
{
  if (type == QtWarningMsg || type == QtCriticalMsg)
    Remarks().append(text.simplified());
  if (type != QtFatalMsg)
    return;
  const QString cause = Remarks().isEmpty() ? text.simplified() : Remarks().last();
  (void)Logging::WriteWithin(STDERR_FILENO,
                             "subject-store-host: cannot open a window: " +
                                 LoggingDetail::PrintableText(cause.toStdString(), Logging::longestText) +
                                 " (--headless does without)\n",
                             Logging::patience);
  std::_Exit(2);
}

/// Qt Quick gives up when there is no graphics driver to draw with, so it is told to draw by itself then.
void ChooseGraphics()
{
  if (!qEnvironmentVariableIsEmpty("QT_QUICK_BACKEND") || !qEnvironmentVariableIsEmpty("QSG_RHI_BACKEND"))
    return;
  QOffscreenSurface surface;
  surface.create();
  QOpenGLContext context;
  if (!context.create() || !context.makeCurrent(&surface))
    QQuickWindow::setGraphicsApi(QSGRendererInterface::Software);
}

}

bool HasDisplay()
{
  return !qEnvironmentVariableIsEmpty("DISPLAY") || !qEnvironmentVariableIsEmpty("WAYLAND_DISPLAY") ||
         !qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM");
}

std::unique_ptr<QCoreApplication> MakeEventLoop(bool window)
{
  // Qt keeps references to both; options are the host's own, and none is Qt's.
  static int argumentCount = 1;
  static char name[] = "subject-store-host";
  static char* arguments[] = {name, nullptr};
  if (!window)
  {
    qInstallMessageHandler(&LogMessage);
    return std::make_unique<QCoreApplication>(argumentCount, arguments);
  }
  qInstallMessageHandler(&EndWithoutDisplay);
  auto application = std::make_unique<QGuiApplication>(argumentCount, arguments);
  ChooseGraphics();
  qInstallMessageHandler(&LogMessage);
  for (const QString& remark : std::as_const(Remarks()))
    NMX::Log(qtLog, NMX::ESeverity::Info, "%1%", remark.toStdString()); // it went well all the same
  QGuiApplication::setApplicationDisplayName("Subject store");
  QQuickStyle::setStyle("Fusion");
  return application;
}

}
