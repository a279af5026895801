#pragma once

#include "HostInterface/NMX/IResult.h"

#include <QMetaType>
#include <QObject>
#include <QString>

namespace SubjectStoreUI
{

/// How an operation ended, as QML sees it.
class VResultGadget
{
  Q_GADGET
  /// The code as the remote API has it.
  Q_PROPERTY(uint code READ Code CONSTANT FINAL)
  Q_PROPERTY(bool failed READ Failed CONSTANT FINAL)
  /// The code's name, such as "NotFound".
  Q_PROPERTY(QString name READ Name CONSTANT FINAL)
  /// Why it failed, for people; empty when it did not.
  Q_PROPERTY(QString reason READ Reason CONSTANT FINAL)

public:
  VResultGadget() = default;
  /// Without a reason, a failure has the sentence of its code.
  VResultGadget(NMX::IResult result, const std::string& reason = {}); // NOLINT(google-explicit-constructor)

  [[nodiscard]] NMX::IResult Result() const { return m_result; }
  [[nodiscard]] uint Code() const { return m_result.Code(); }
  [[nodiscard]] bool Failed() const { return m_result.Failed(); }
  [[nodiscard]] QString Name() const;
  [[nodiscard]] QString Reason() const { return m_reason; }

private:
  NMX::IResult m_result;
  QString m_reason;
};

}

Q_DECLARE_METATYPE(SubjectStoreUI::VResultGadget)
