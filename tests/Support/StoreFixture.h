#pragma once

#include "StandaloneHost/Store/IArchive.h"
#include "StandaloneHost/Store/VStore.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"

#include <gtest/gtest.h>

#include <atomic>
#include <memory>
#include <string>
#include <string_view>
#include <utility>

/// An archive that keeps nothing, and whose disk can be full.
struct UnkeptArchive : Store::IArchive
{
  Store::ChangeSet Load() override { return {{}, {}, NMX::TSubjectStoreId(1)}; }
  NMX::IResult Keep(const Store::ChangeSet&, const Store::StoreState&) override
  {
    ++commits;
    return full ? NMX::EResult::DiskFull : NMX::EResult::Ok;
  }
  std::atomic<int> commits = 0;
  std::atomic<bool> full = false;
};

/// A test with a store of its own. Each of the edits is one commit, which must succeed.
class StoreFixture : public testing::Test
{
protected:
  using Id = NMX::TSubjectStoreId;

  template <class Edit>
  void Change(Edit edit)
  {
    const auto editor = store->Editor();
    edit(*editor);
    EXPECT_TRUE(editor->Commit().Succeeded());
  }

  Id Add(NMX::ESubjectKind kind, std::string_view name)
  {
    Id id;
    Change([&](NMX::IEntryEditor& editor) { EXPECT_TRUE(editor.Add(kind, name, id).Succeeded()) << name; });
    return id;
  }

  void Remove(Id id)
  {
    Change([&](NMX::IEntryEditor& editor) { EXPECT_TRUE(editor.Remove(id).Succeeded()); });
  }

  void Set(Id id, NMX::EntryPath path, NMX::Value value)
  {
    Change([&](NMX::IEntryEditor& editor)
           { EXPECT_TRUE(editor.SetValue(id, path, std::move(value)).Succeeded()) << path; });
  }

  void SetApplication(const std::string& path, NMX::Value value)
  {
    Change([&](NMX::IEntryEditor& editor)
           { EXPECT_TRUE(editor.SetApplicationEntry(NMX::EntryPath(path), std::move(value)).Succeeded()) << path; });
  }

  template <class T>
  [[nodiscard]] T Get(Id id, NMX::EntryPath path) const
  {
    T value{};
    EXPECT_TRUE(NMX::Read(*store->Reader(), id, path, value).Succeeded()) << path;
    return value;
  }

  UnkeptArchive& archive = *new UnkeptArchive; // the store's
  std::shared_ptr<Store::VStore> store = NMX::MakeShared<Store::VStore>(std::unique_ptr<Store::IArchive>(&archive));
};
