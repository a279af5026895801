// Frame times of a list of 10,000 subjects that scrolls, first while nothing changes and then while another thread
// commits 1,000 edits each second. Usage: view-frames [SECONDS]; without a display, QT_QPA_PLATFORM=offscreen.

#include "StandaloneHost/Postal/VGuiPostalService.h"
#include "StandaloneHost/Store/VStore.h"
#include "StoreInterface/EntryPaths.h"
#include "SubjectStoreUI/VSortSubjectsProxyModel.h"
#include "SubjectStoreUI/VSubjectListModelStore.h"
#include "SubjectStoreUI/VSubjectModelInternalData.h"
#include "SubjectStoreUI/VSubjectStoreProxyModel.h"
#include "benchmarks/FrameTimes.h"

#include <QDir>
#include <QGuiApplication>
#include <QQmlContext>
#include <QQmlEngine>
#include <QQuickItem>
#include <QQuickView>
#include <QTemporaryFile>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <string>
#include <thread>
#include <vector>

namespace
{

using namespace SubjectStoreUI;
using namespace std::chrono_literals;

constexpr int subjectCount = 10000;

constexpr const char* listOfSubjects = R"(
import QtQuick
ListView {
  id: list
  model: subjects
  reuseItems: true
  delegate: Item {
    required property int index
    required property string subjectName
    required property var subjectEnabled
    required property var subjectWarnings
    width: list.width
    height: 24
    Rectangle { width: 12; height: 12; radius: 6; color: parent.subjectEnabled ? "green" : "grey" }
    Text { x: 20; text: parent.subjectName }
    Text { x: 300; text: parent.subjectWarnings.length }
  }
  NumberAnimation on contentY { from: 0; to: 24 * 9900; duration: 200000; running: true }
}
)";

std::vector<NMX::TSubjectStoreId> Fill(NMX::IStore& store)
{
  std::vector<NMX::TSubjectStoreId> ids;
  const auto editor = store.Editor();
  for (int number = 0; number < subjectCount; ++number)
  {
    ids.emplace_back();
    (void)editor->Add(NMX::ESubjectKind::BasicObjects, "Subject " + std::to_string(number), ids.back());
  }
  (void)editor->Commit();
  return ids;
}

/// Edits that change a value, a name or the rows, in turn.
void Edit(NMX::IStore& store, const std::vector<NMX::TSubjectStoreId>& ids, std::size_t count)
{
  const NMX::TSubjectStoreId id = ids[count * 7919 % ids.size()];
  const auto editor = store.Editor();
  if (count % 10 == 0)
    (void)editor->Rename(id, "Renamed " + std::to_string(count), NMX::ENotify::Yes);
  else
    (void)editor->SetValue(id, NMX::Paths::Enabled(), count / ids.size() % 2 != 0);
  (void)editor->Commit();
}

}

int main(int argumentCount, char** arguments)
{
  QGuiApplication application(argumentCount, arguments);
  const int seconds = argumentCount > 1 ? std::max(1, std::atoi(arguments[1])) : 10;
  const auto store = NMX::MakeShared<Store::VStore>();
  const auto ids = Fill(*store);
  const auto gui = std::make_shared<Postal::VGuiPostalService>();
  const auto list = NMX::MakeShared<VSubjectListModelStore>(std::make_shared<VSubjectModelInternalData>(store, gui));
  list->followStore(100);
  VSortSubjectsProxyModel sorted(NMX::MakeShared<VSubjectStoreProxyModel>(list), VSubjectTypeGadget(), "", nullptr);

  QTemporaryFile qml(QDir::tempPath() + "/XXXXXX.qml");
  if (!qml.open() || qml.write(listOfSubjects) < 0 || !qml.flush())
    return 1;
  QQuickView view;
  view.rootContext()->setContextProperty("subjects", &sorted);
  view.setResizeMode(QQuickView::SizeRootObjectToView);
  view.setSource(QUrl::fromLocalFile(qml.fileName()));
  view.resize(600, 900);
  view.show();
  if (view.status() != QQuickView::Ready)
    return 1;

  FrameTimes frames(view);
  frames.Run(nullptr, 1s); // warm
  frames.Run("nothing changes:", seconds * 1000ms);
  std::size_t edits = 0;
  {
    const std::jthread editing(
        [&](const std::stop_token& stop)
        {
          for (auto next = std::chrono::steady_clock::now(); !stop.stop_requested(); next += 1ms)
          {
            std::this_thread::sleep_until(next);
            Edit(*store, ids, edits++);
          }
        });
    frames.Run("1,000 edits a second:", seconds * 1000ms);
  }
  std::printf("%zu edits in %d s\n", edits, seconds);
  gui->Stop();
  return 0;
}
