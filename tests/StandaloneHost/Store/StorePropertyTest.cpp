#include "StandaloneHost/Store/SqliteArchive.h"
#include "StandaloneHost/Store/VStore.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"
#include "tests/Support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <map>
#include <random>

using NMX::ESubjectKind;
using NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

/// What must hold of a subject, kept in the plainest way there is.
struct Plain
{
  ESubjectKind kind{};
  std::string name;
  bool enabled = true;
  TSubjectStoreId parent;
};

using Model = std::map<TSubjectStoreId, Plain>;

class RandomEdits
{
public:
  explicit RandomEdits(unsigned seed) : m_random(seed) {}

  /// One transaction of a few edits, committed or discarded.
  void Transaction(NMX::IStore& store, Model& model)
  {
    Model draft = model;
    const auto editor = store.Editor();
    for (int edits = Below(4); edits >= 0; --edits)
      Edit(*editor, draft);
    if (Below(4) != 0)
    {
      ASSERT_TRUE(editor->Commit().Succeeded());
      model = std::move(draft);
    }
  }

private:
  int Below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }

  std::string AnyName() { return "Subject " + std::to_string(Below(40)); }

  TSubjectStoreId Any(const Model& model)
  {
    return std::next(model.begin(), Below(static_cast<int>(model.size())))->first;
  }

  static bool Taken(const Model& model, const std::string& name)
  {
    return std::any_of(model.begin(), model.end(), [&](const auto& entry) { return entry.second.name == name; });
  }

  static bool IsBeneath(const Model& model, TSubjectStoreId id, TSubjectStoreId ancestor)
  {
    for (; id.Valid(); id = model.at(id).parent)
      if (id == ancestor)
        return true;
    return false;
  }

  void Edit(NMX::IEntryEditor& editor, Model& model)
  {
    const int what = model.empty() ? 0 : Below(6);
    if (what == 0)
    {
      const auto kind = NMX::allSubjectKinds[static_cast<std::size_t>(Below(8))];
      const std::string name = AnyName();
      const bool taken = Taken(model, name);
      TSubjectStoreId id;
      EXPECT_EQ(editor.Add(kind, name, id).Failed(), taken);
      if (!taken)
        model[id] = {kind, name, true, {}};
      return;
    }
    const TSubjectStoreId id = Any(model);
    if (what == 1)
    {
      EXPECT_TRUE(editor.Remove(id).Succeeded());
      model.erase(id);
      for (auto& [other, plain] : model)
        if (plain.parent == id)
          plain.parent = {};
    }
    else if (what == 2)
    {
      const std::string name = AnyName();
      const bool taken = Taken(model, name) && model[id].name != name;
      EXPECT_EQ(editor.Rename(id, name, NMX::ENotify::Yes).Failed(), taken);
      if (!taken)
        model[id].name = name;
    }
    else if (what == 3)
    {
      model[id].enabled = Below(2) != 0;
      EXPECT_TRUE(editor.SetValue(id, Paths::Enabled(), model[id].enabled).Succeeded());
    }
    else
    {
      const TSubjectStoreId parent = Below(3) == 0 ? TSubjectStoreId{} : Any(model);
      const bool cycle = IsBeneath(model, parent, id);
      EXPECT_EQ(editor.SetValue(id, Paths::ParentSubjectId(), parent).Failed(), cycle);
      if (!cycle)
        model[id].parent = parent;
    }
  }

  std::mt19937 m_random;
};

/// The store holds what the model holds, and its indexes agree with each other.
void ExpectSame(const NMX::IStore& store, const Model& model)
{
  const auto reader = store.Reader();
  std::size_t listed = 0;
  for (const ESubjectKind kind : NMX::allSubjectKinds)
  {
    std::vector<TSubjectStoreId> ids;
    ASSERT_TRUE(reader->Subjects(kind, ids).Succeeded());
    EXPECT_TRUE(std::is_sorted(ids.begin(), ids.end()));
    listed += ids.size();
    for (const TSubjectStoreId id : ids)
      ASSERT_TRUE(model.contains(id) && model.at(id).kind == kind);
  }
  ASSERT_EQ(listed, model.size());
  std::map<TSubjectStoreId, std::vector<TSubjectStoreId>> children;
  for (const auto& [id, plain] : model)
  {
    TSubjectStoreId found, parent;
    std::string name;
    bool enabled = !plain.enabled;
    ASSERT_TRUE(reader->FindByName(plain.name, found).Succeeded()) << plain.name;
    ASSERT_EQ(found, id);
    ASSERT_TRUE(NMX::Read(*reader, id, Paths::Name(), name).Succeeded());
    ASSERT_EQ(name, plain.name);
    ASSERT_TRUE(NMX::Read(*reader, id, Paths::Enabled(), enabled).Succeeded());
    ASSERT_EQ(enabled, plain.enabled);
    ASSERT_TRUE(NMX::Read(*reader, id, Paths::ParentSubjectId(), parent).Succeeded());
    ASSERT_EQ(parent, plain.parent);
    children[plain.parent].push_back(id);
  }
  for (const auto& [id, plain] : model)
  {
    std::vector<TSubjectStoreId> ids;
    ASSERT_TRUE(reader->Children(id, ids).Succeeded());
    ASSERT_EQ(ids, children[id]);
  }
}

}

TEST(StoreProperty, RandomEditsNeverDivergeFromAPlainModelAndSurviveReopening)
{
  const TemporaryFolder folder;
  const auto open = [&]
  { return NMX::MakeShared<Store::VStore>(std::make_unique<Store::SqliteArchive>(folder.Path() / "store.sqlite")); };
  Model model;
  RandomEdits edits(20240611);
  for (int session = 0; session < 6; ++session)
  {
    const auto store = open();
    ExpectSame(*store, model);
    for (int i = 0; i < 500; ++i)
    {
      edits.Transaction(*store, model);
      if (i % 10 == 0)
        ExpectSame(*store, model);
      if (testing::Test::HasFailure())
        FAIL() << "session " << session << ", transaction " << i;
    }
  }
}
