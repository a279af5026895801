#include "SubjectStoreUI/VSubjectWarningSummary.h"
#include "SubjectStoreUI/WarningGadget.h"
#include "SubjectStoreUI/WarningTypes.h"

#include "StandaloneHost/Store/Schema.h"

#include <QMetaProperty>
#include <QSignalSpy>
#include <gmock/gmock.h>

#include <limits>
#include <map>
#include <regex>
#include <string>
#include <vector>

using SubjectStoreUI::VSubjectWarningSummary;
using SubjectStoreUI::VWarningGadget;
using SubjectStoreUI::WarningSentence;
using SubjectStoreUI::WarningTypeId;

namespace
{

/// What a view reads, a sentence each: "4: 1 character has unassigned slots.", and at last the total.
std::vector<std::string> Shown(const VSubjectWarningSummary& summary)
{
  const QMetaObject& fields = VWarningGadget::staticMetaObject;
  std::vector<std::string> lines;
  for (const QVariant& value : summary.property("subjectWarnings").toList())
  {
    const auto read = [&](const char* field)
    { return fields.property(fields.indexOfProperty(field)).readOnGadget(value.constData()).toString().toStdString(); };
    lines.push_back(read("typeId") + ": " + read("text"));
  }
  lines.push_back(summary.property("totalWarningCount").toString().toStdString());
  return lines;
}

}

TEST(WarningTypes, AreTheStoresEntriesInAFixedOrderAndThoseOfSubjectsHaveWellFormedSentences)
{
  std::vector<std::string> entries;
  for (const auto& entry : Store::KindSchema::Of(NMX::ESubjectKind::SmartObjects).Entries())
    if (entry.path.Text().starts_with("Warnings/"))
      entries.emplace_back(entry.path.Text());
  std::vector<std::string> keys;
  for (const auto& type : SubjectStoreUI::WarningTypes().subspan(1))
    keys.push_back("Warnings/" + std::string(type.key));
  EXPECT_THAT(keys, testing::UnorderedElementsAreArray(entries));

  EXPECT_EQ(WarningTypeId("Warnings"), 0);
  EXPECT_EQ(WarningTypeId("WarningNotCalibrated"), 10);
  EXPECT_EQ(WarningTypeId("WarningActiveMarkersOff"), 20);
  EXPECT_EQ(WarningTypeId("WarningRadioConflict"), 30);
  EXPECT_EQ(WarningTypeId("NotCalibrated"), std::nullopt);

  const std::regex form("%1 (smart object|character|labeling cluster|subject|object)%2 [a-z][^%]*[^ %]\\.");
  for (int id = 1; id <= 20; ++id)
    EXPECT_TRUE(std::regex_match(std::string(WarningSentence(id)), form)) << id;
  for (const int id : {std::numeric_limits<int>::min(), -1, 0, 21, 30, 31, std::numeric_limits<int>::max()})
    EXPECT_EQ(WarningSentence(id), "") << id;
}

TEST(WarningSummary, SaysOneSentencePerTypeAndTableAndTellsOnceOfEachChange)
{
  struct Step
  {
    std::map<int, int> topLevel;
    std::map<int, int> children;
    int signalCount;
    std::vector<std::string> shown;
  };
  const std::string one = "2: 1 smart object has duplicate patterns.";
  const std::string two = "2: 2 smart objects have duplicate patterns.";
  const std::string empty = "4: 1234567 characters have unassigned slots.";
  const Step steps[] = {
      {{}, {}, 0, {"0"}},
      {{{2, 1}}, {}, 1, {one, "1"}},
      {{{2, 1}}, {}, 0, {one, "1"}},
      {{{-1, 7}, {0, 7}, {2, 1}, {3, 0}, {5, -2}, {21, 7}}, {{3, 0}, {31, 4}}, 0, {one, "1"}},
      {{{2, 2}}, {}, 1, {two, "2"}},
      {{{3, 2}}, {}, 1, {"3: 2 smart objects have not been assigned a pattern.", "2"}},
      {{{2, 2}, {4, 1234567}}, {}, 1, {two, empty, "1234569"}},
      {{{4, 1234567}}, {{2, 2}}, 1, {empty, two, "1234569"}},
      {{{2, 1}, {4, 1234567}}, {{2, 2}}, 1, {one, empty, two, "1234570"}},
      {{}, {}, 1, {"0"}},
  };
  VSubjectWarningSummary summary;
  QSignalSpy changes(&summary, &VSubjectWarningSummary::subjectWarningsChanged);
  for (const Step& step : steps)
  {
    changes.clear();
    summary.update(step.topLevel, step.children);
    EXPECT_EQ(Shown(summary), step.shown);
    EXPECT_EQ(changes.size(), step.signalCount) << testing::PrintToString(step.shown);
  }
}
