#pragma once

#include "StoreInterface/SubjectKind.h"

#include <QMetaType>
#include <QObject>
#include <QString>

namespace SubjectStoreUI
{

/// A kind of subject as QML sees it.
class VSubjectTypeGadget
{
  Q_GADGET
  Q_PROPERTY(int kind READ Kind CONSTANT)
  /// The kind's key in the store, such as "BasicObjects".
  Q_PROPERTY(QString key READ Key CONSTANT)

public:
  VSubjectTypeGadget() = default;
  explicit VSubjectTypeGadget(NMX::ESubjectKind kind) : m_kind(kind) {}

  [[nodiscard]] int Kind() const { return static_cast<int>(m_kind); }
  [[nodiscard]] QString Key() const
  {
    const std::string_view key = NMX::KindKey(m_kind);
    return QString::fromLatin1(key.data(), static_cast<qsizetype>(key.size()));
  }

  friend bool operator==(const VSubjectTypeGadget&, const VSubjectTypeGadget&) = default;

private:
  NMX::ESubjectKind m_kind = NMX::ESubjectKind::BasicObjects;
};

}

Q_DECLARE_METATYPE(SubjectStoreUI::VSubjectTypeGadget)
