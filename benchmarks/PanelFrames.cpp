// The panel over 5,000 subjects: how long it takes to its first frame, and its frame times while it scrolls, first
// while nothing changes and then while another thread commits 1,000 edits each second. Usage: panel-frames [SECONDS];
// without a display, QT_QPA_PLATFORM=offscreen.

#include "benchmarks/FrameTimes.h"
#include "tests/Panel/Stage.h"

#include <QGuiApplication>
#include <QPropertyAnimation>
#include <QQuickItem>
#include <QQuickStyle>
#include <QQuickView>

#include <thread>

using namespace std::chrono_literals;

namespace
{

constexpr int subjectCount = 5000;

/// The list of subjects: the one view that knows the panel's rows and can bring a subject into sight.
QQuickItem* FindList(QQuickItem& item)
{
  if (item.property("rows").isValid() && item.property("contentY").isValid())
    return &item;
  for (QQuickItem* child : item.childItems())
    if (QQuickItem* found = FindList(*child))
      return found;
  return nullptr;
}

}

int main(int argumentCount, char** arguments)
{
  QGuiApplication application(argumentCount, arguments);
  QQuickStyle::setStyle("Fusion");
  const int seconds = argumentCount > 1 ? std::max(1, std::atoi(arguments[1])) : 10;
  QQuickView view;
  Stage stage(*view.engine());
  for (int number = 0; number < subjectCount; ++number)
    stage.add(number % 2 != 0 ? "BasicObjects" : "SmartObjects", "Subject " + QString::number(number));
  QElapsedTimer sinceStart;
  sinceStart.start();
  view.setResizeMode(QQuickView::SizeRootObjectToView);
  view.setSource(QUrl("qrc:/qml/Tavix/SubjectStore/Panel/SubjectPanel.qml"));
  if (view.status() != QQuickView::Ready)
    return 1;
  view.resize(1200, 900);
  qint64 firstFrame = 0;
  QObject::connect(
      &view, &QQuickWindow::frameSwapped, &view,
      [&]
      {
        if (firstFrame == 0)
          firstFrame = sinceStart.elapsed();
      },
      Qt::DirectConnection);
  view.show();
  FrameTimes frames(view);
  frames.Run(nullptr, 2s);
  std::printf("first frame after %lld ms\n", static_cast<long long>(firstFrame));
  QQuickItem* list = FindList(*view.rootObject());
  if (list == nullptr)
    return 1;
  QPropertyAnimation scrolling(list, "contentY");
  scrolling.setDuration(seconds * 3000);
  scrolling.setStartValue(0);
  scrolling.setEndValue(list->property("contentHeight").toReal() - list->height());
  scrolling.start();
  frames.Run("nothing changes:", seconds * 1000ms);
  {
    const std::jthread editing(
        [&](const std::stop_token& stop)
        {
          int edits = 0;
          for (auto next = std::chrono::steady_clock::now(); !stop.stop_requested(); next += 1ms)
          {
            std::this_thread::sleep_until(next);
            const QString name = "Subject " + QString::number(edits * 7919 % subjectCount);
            stage.set(name, "Parameters/Enabled", ++edits / subjectCount % 2 != 0);
          }
        });
    frames.Run("1,000 edits a second:", seconds * 1000ms);
  }
  view.setSource({});
  return 0;
}
