#pragma once

#include "HostInterface/NMX/ITypedId.h"
#include "HostInterface/SelectionItem.h"

#include <QMetaType>
#include <QObject>
#include <QString>

#include <utility>

namespace SubjectStoreUI
{

/// The id of a subject, or of something else in the store, as QML sees it: something to compare and to hand back. A
/// JavaScript number could not hold it.
class VStoreIdGadget
{
  Q_GADGET
  Q_PROPERTY(bool valid READ Valid CONSTANT)

public:
  VStoreIdGadget() = default;
  explicit VStoreIdGadget(NMX::TSubjectStoreId id) : m_id(id) {}

  [[nodiscard]] NMX::TSubjectStoreId Id() const { return m_id; }
  [[nodiscard]] bool Valid() const { return m_id.Valid(); }
  Q_INVOKABLE [[nodiscard]] QString toString() const { return QString::number(m_id.Value()); }
  /// One of its own. What QML reads from a row of a model is no value but a way to the row's value, which may go.
  Q_INVOKABLE [[nodiscard]] SubjectStoreUI::VStoreIdGadget copy() const { return *this; }
  Q_INVOKABLE [[nodiscard]] bool equals(const SubjectStoreUI::VStoreIdGadget& other) const
  {
    return m_id == other.m_id;
  }

  friend bool operator==(const VStoreIdGadget&, const VStoreIdGadget&) = default;

private:
  NMX::TSubjectStoreId m_id;
};

/// What a row stands for in a selection: a subject, a slot of a character, or a device.
class VSelectionItemGadget
{
  Q_GADGET
  Q_PROPERTY(SubjectStoreUI::VStoreIdGadget subject READ Subject CONSTANT)
  Q_PROPERTY(int slot READ Slot CONSTANT)
  Q_PROPERTY(QString device READ Device CONSTANT)

public:
  VSelectionItemGadget() = default;
  /// `slot` is the slot's position; -1 for the subject itself.
  explicit VSelectionItemGadget(NMX::TSubjectStoreId subject, int slot = -1) : m_item{subject, slot, {}} {}
  explicit VSelectionItemGadget(SelectionItem item) : m_item(std::move(item)) {}

  [[nodiscard]] const SelectionItem& Item() const { return m_item; }
  [[nodiscard]] VStoreIdGadget Subject() const { return VStoreIdGadget(m_item.subject); }
  [[nodiscard]] int Slot() const { return m_item.slot; }
  [[nodiscard]] QString Device() const { return QString::fromStdString(m_item.device); }
  Q_INVOKABLE [[nodiscard]] SubjectStoreUI::VSelectionItemGadget copy() const { return *this; }
  Q_INVOKABLE [[nodiscard]] bool equals(const SubjectStoreUI::VSelectionItemGadget& other) const
  {
    return *this == other;
  }

  friend bool operator==(const VSelectionItemGadget&, const VSelectionItemGadget&) = default;

private:
  SelectionItem m_item;
};

/// A place in mm.
class VPositionGadget
{
  Q_GADGET
  Q_PROPERTY(double x MEMBER x CONSTANT)
  Q_PROPERTY(double y MEMBER y CONSTANT)
  Q_PROPERTY(double z MEMBER z CONSTANT)

public:
  double x = 0;
  double y = 0;
  double z = 0;

  friend bool operator==(const VPositionGadget&, const VPositionGadget&) = default;
};

}

Q_DECLARE_METATYPE(SubjectStoreUI::VStoreIdGadget)
Q_DECLARE_METATYPE(SubjectStoreUI::VSelectionItemGadget)
Q_DECLARE_METATYPE(SubjectStoreUI::VPositionGadget)
