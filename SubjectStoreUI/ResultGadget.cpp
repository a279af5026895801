#include "SubjectStoreUI/ResultGadget.h"

#include "StoreUI/ResultSentence.h"

namespace SubjectStoreUI
{

VResultGadget::VResultGadget(NMX::IResult result, const std::string& reason)
    : m_result(result),
      m_reason(QString::fromStdString(reason.empty() || result.Succeeded() ? StoreUI::ResultSentence(result) : reason))
{
}

QString VResultGadget::Name() const
{
  const std::string_view name = m_result.Name();
  return QString::fromLatin1(name.data(), static_cast<qsizetype>(name.size()));
}

}
