#pragma once

#include "SubjectStoreUI/SubjectGadgets.h"
#include "SubjectStoreUI/SubjectsModelRole.h"
#include "SubjectStoreUI/VSubjectListModelStore.h"
#include "SubjectStoreUI/VSubjectModelInternalData.h"
#include "SubjectStoreUI/VSubjectTreeModelStore.h"
#include "SubjectStoreUI/VSubjectWithSlotsTreeModelStore.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/StoreFixture.h"

#include <QCoreApplication>

#include <memory>
#include <string>
#include <vector>

using Names = std::vector<std::string>;

inline std::string NameOf(const QModelIndex& index)
{
  return index.data(SubjectStoreUI::SubjectsModelRole::SubjectName).toString().toStdString();
}

inline Names NamesBeneath(const QAbstractItemModel& model, const QModelIndex& parent = {})
{
  Names names;
  for (int row = 0; row < model.rowCount(parent); ++row)
    names.push_back(NameOf(model.index(row, 0, parent)));
  return names;
}

inline NMX::TSubjectStoreId IdAt(const QModelIndex& index)
{
  return index.data(SubjectStoreUI::SubjectsModelRole::SubjectStoreId).value<SubjectStoreUI::VStoreIdGadget>().Id();
}

inline void ExpectSameRow(const QModelIndex& row, const QModelIndex& expected)
{
  ASSERT_TRUE(row.isValid() && expected.isValid());
  for (const int role : SubjectStoreUI::SubjectsModelRole::All())
    ASSERT_EQ(row.data(role), expected.data(role)) << NameOf(expected) << " role " << role;
}

/// The models say the same of as many rows at every level.
inline void ExpectSame(const QAbstractItemModel& model, const QAbstractItemModel& expected,
                       const QModelIndex& parent = {}, const QModelIndex& expectedParent = {})
{
  ASSERT_EQ(model.rowCount(parent), expected.rowCount(expectedParent)) << NameOf(expectedParent);
  for (int row = 0; row < model.rowCount(parent); ++row)
  {
    const QModelIndex index = model.index(row, 0, parent);
    const QModelIndex expectedIndex = expected.index(row, 0, expectedParent);
    ExpectSameRow(index, expectedIndex);
    ExpectSame(model, expected, index, expectedIndex);
  }
}

/// The roles that the model may change without a word: trees do not tell of devices.
inline QList<int> Untold(const SubjectStoreUI::VSubjectModelStoreBase& model)
{
  namespace Role = SubjectStoreUI::SubjectsModelRole;
  if (qobject_cast<const SubjectStoreUI::VSubjectListModelStore*>(&model) != nullptr)
    return {};
  return {Role::SubjectSmartClusterDeviceNames, Role::SubjectPatterns};
}

/// A test of models of subjects, with a store of its own. Tasks for the GUI thread run when the test says so.
class ModelFixture : public StoreFixture
{
protected:
  template <class Model = SubjectStoreUI::VSubjectListModelStore>
  std::shared_ptr<Model> MakeList()
  {
    return NMX::MakeShared<Model>(data, &summary);
  }

  template <class Model = SubjectStoreUI::VSubjectTreeModelStore>
  std::shared_ptr<Model> MakeTree(NMX::ESubjectKind kind)
  {
    return NMX::MakeShared<Model>(data, kind, &summary);
  }

  std::shared_ptr<SubjectStoreUI::VSubjectWithSlotsTreeModelStore> MakeSlotTree()
  {
    return MakeTree<SubjectStoreUI::VSubjectWithSlotsTreeModelStore>(NMX::ESubjectKind::CharactersFromClusters);
  }

  int argumentCount = 0;
  QCoreApplication application{argumentCount, nullptr};
  std::shared_ptr<ManualPostal> gui = std::make_shared<ManualPostal>();
  std::shared_ptr<SubjectStoreUI::VSubjectModelInternalData> data =
      std::make_shared<SubjectStoreUI::VSubjectModelInternalData>(store, gui);
  SubjectStoreUI::VSubjectWarningSummary summary;
};
