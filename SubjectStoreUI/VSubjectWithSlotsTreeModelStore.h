#pragma once

#include "SubjectStoreUI/SequenceRows.h"
#include "SubjectStoreUI/SubjectTree.h"

namespace SubjectStoreUI
{

namespace SlotTree
{

/// What stands behind a row: a character, or one of its slots with the subject in it, if there is one.
class IItem
{
public:
  explicit IItem(NMX::TSubjectStoreId subject) : m_subject(subject) {}
  IItem(NMX::TSubjectStoreId character, SlotContent slot, int row)
      : m_subject(slot.subject), m_character(character), m_slot(std::move(slot)), m_row(row)
  {
  }

  /// The character, or the subject in the slot; the invalid id for an empty slot.
  [[nodiscard]] NMX::TSubjectStoreId Subject() const { return m_subject; }
  /// The character that the slot is of.
  [[nodiscard]] NMX::TSubjectStoreId Parent() const { return m_character; }
  [[nodiscard]] bool TopLevel() const { return !m_character.Valid(); }
  /// What tells the slot from the others of the character.
  [[nodiscard]] NMX::TSubjectStoreId Key() const { return m_slot.slot; }
  [[nodiscard]] const SlotContent& Slot() const { return m_slot; }

  /// The row that the slot was told to be in.
  [[nodiscard]] int Row() const { return m_row; }

  void Show(const SlotContent& slot, int row)
  {
    m_slot = slot;
    m_subject = slot.subject;
    m_row = row;
  }

private:
  NMX::TSubjectStoreId m_subject;
  NMX::TSubjectStoreId m_character;
  SlotContent m_slot;
  int m_row = 0;
};

/// What a refresh has learnt of a slot.
struct ChildChange
{
  NMX::TSubjectStoreId key;
  ChangedAspects aspects; ///< of the subject in it
  SlotContent slot;

  [[nodiscard]] bool Shows(const IItem& item) const { return item.Slot() == slot; }
};

}

/// The subjects of one kind, and beneath each its slots in their own order, filled or empty. [gui]
class VSubjectWithSlotsTreeModelStore
    : public SubjectTree<SlotTree::IItem, SequenceRows<SlotTree::IItem>, SlotTree::ChildChange>
{
  Q_OBJECT

public:
  using IItem = SlotTree::IItem;

  VSubjectWithSlotsTreeModelStore(std::shared_ptr<ISubjectModelInternalData> data, NMX::ESubjectKind filter,
                                  VSubjectWarningSummary* summary = nullptr);

  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override;

protected:
  [[nodiscard]] std::vector<SlotTree::ChildChange>
  GatherChildren(const NMX::IStoreReader& access, NMX::TSubjectStoreId subject, SeenStamps& seen) const override;
  SequenceRows<IItem>::Cursor InsertChild(SequenceRows<IItem>& rows, SequenceRows<IItem>::Cursor before,
                                          NMX::TSubjectStoreId parent, const SlotTree::ChildChange& change) override;
  QList<int> UpdateChild(IItem& item, int row, const SlotTree::ChildChange& change) override;

private:
  [[nodiscard]] QVariant SlotData(const IItem& item, int row, int role) const;
};

/// Two characters for a slot's name: its first letter and its next capital, or else its second letter; "??" when it has
/// only one.
[[nodiscard]] QString ShortSlotName(const QString& name);

}
