#pragma once

#include <QObject>
#include <QString>

namespace SubjectStoreUI
{

/// What the panel says about one warning type: the value that views read.
struct VWarningGadget
{
  Q_GADGET
  Q_PROPERTY(int typeId MEMBER typeId CONSTANT FINAL)
  Q_PROPERTY(QString text MEMBER text CONSTANT FINAL)

public:
  int typeId = 0;
  QString text;

  friend bool operator==(const VWarningGadget&, const VWarningGadget&) = default;
};

}
