#pragma once

#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/IStore.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <random>
#include <string>
#include <utility>
#include <vector>

/// Edits of everything that models of subjects show, some in each transaction. Subjects come and go, and now and then
/// all go. Others may edit the store at the same time.
class RandomStoreEdits
{
public:
  explicit RandomStoreEdits(unsigned seed) : m_random(seed) {}

  void Transaction(NMX::IStore& store) { EXPECT_TRUE(TryTransaction(store).Succeeded()); }

  /// What its commit came to.
  NMX::IResult TryTransaction(NMX::IStore& store)
  {
    const auto editor = store.Editor();
    const bool emptying = ++m_transactions % 800 < 25;
    for (int edits = emptying ? 4 : 1 + Below(3); edits > 0; --edits)
      Edit(*editor, emptying);
    return editor->Commit();
  }

  int Below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }

private:
  using Id = NMX::TSubjectStoreId;

  /// The store may refuse it: names are taken, kinds lack entries, and parents would be beneath their children.
  void Edit(NMX::IEntryEditor& editor, bool emptying)
  {
    using enum NMX::ESubjectKind;
    namespace Paths = NMX::Paths;
    constexpr NMX::ESubjectKind kinds[] = {BasicObjects, SmartObjects, CharactersFromClusters, GeneralSubjects, Props};
    std::vector<Id> all;
    for (const NMX::ESubjectKind kind : kinds)
    {
      std::vector<Id> ids;
      EXPECT_TRUE(editor.Subjects(kind, ids).Succeeded());
      all.insert(all.end(), ids.begin(), ids.end());
    }
    const int known = static_cast<int>(all.size());
    const auto any = [&] { return known == 0 ? Id{} : all[static_cast<std::size_t>(Below(known))]; };
    const Id id = any();
    const auto set = [&](NMX::EntryPath path, NMX::Value value) { (void)editor.SetValue(id, path, std::move(value)); };
    const std::string name = std::string(1, "abAB"[Below(4)]) + std::to_string(Below(1000));
    const auto count = static_cast<std::size_t>(Below(4));
    Id added;
    switch (emptying || known == 0 ? 0 : Below(13))
    {
    case 0:
    case 1:
    case 2:
      if (emptying || known > 12 + Below(8))
        (void)editor.Remove(id);
      else
        (void)editor.Add(kinds[Below(5)], name, added);
      break;
    case 3:
      return (void)editor.Rename(id, name, NMX::ENotify::Yes);
    case 4:
      return set(Paths::Enabled(), Below(2) != 0);
    case 5:
      return set(Paths::WarningObjectConfusion(), Below(2) != 0);
    case 6:
    case 7:
      return set(Paths::ParentSubjectId(), Below(3) == 0 ? Id{} : any());
    case 8:
      return set(Paths::ParentSubjectSlotId(), Id(Below(5)));
    case 9:
      return set(Paths::Slots(), RandomSlots());
    case 10:
      return set(Paths::SmartClusters(), std::vector<NMX::SmartCluster>(count, {name, name, 1, "Corvex1"}));
    case 11:
      return set(Paths::Markers(), std::vector<NMX::Position>(count, {1.0 * Below(9), 2, 3}));
    default:
      return set(Paths::AutoAssignEnabled(), Below(4) == 0);
    }
  }

  /// Some of five slots, in any order.
  std::vector<NMX::Slot> RandomSlots()
  {
    std::vector<NMX::Slot> made;
    for (std::uint64_t slot = 1; slot <= 5; ++slot)
      if (Below(3) != 0)
        made.push_back({Id(slot), "Slot " + std::to_string(Below(3))});
    std::shuffle(made.begin(), made.end(), m_random);
    return made;
  }

  std::mt19937 m_random;
  int m_transactions = 0;
};
