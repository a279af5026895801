// Drives the real panel against the real store: the QML tests in this folder.

#include "tests/Panel/Stage.h"

#include <QQmlContext>
#include <QQmlEngine>
#include <QQuickStyle>
#include <QtQuickTest>

#include <memory>

/// Each file of tests has an engine, and a stage, of its own.
class Setup final : public QObject
{
  Q_OBJECT

public Q_SLOTS:
  void applicationAvailable() { QQuickStyle::setStyle("Fusion"); }

  void qmlEngineAvailable(QQmlEngine* engine)
  {
    m_stage = std::make_unique<Stage>(*engine);
    engine->rootContext()->setContextProperty("stage", m_stage.get());
  }

  void cleanupTestCase() { m_stage.reset(); }

private:
  std::unique_ptr<Stage> m_stage;
};

QUICK_TEST_MAIN_WITH_SETUP(Panel, Setup)

#include "Main.moc"
