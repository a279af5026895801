#include "SubjectStoreUI/VObjectEvaluationQml.h"

#include "HostInterface/RunaCorePluginInterface/IObjectEvaluationSettings.h"
#include "SubjectStoreUI/ObjectEvaluationWatch.h"
#include "SubjectStoreUI/PanelBackend.h"

#include <cmath>

namespace SubjectStoreUI
{

using NMX::EResult;
using NMX::IResult;

namespace
{

/// The greatest whole number up to which a double has them all.
constexpr double greatestWholeNumber = 9007199254740992.0;

}

VObjectEvaluationQml::VObjectEvaluationQml(const PanelBackend& backend)
    : m_settings(backend.Get(&RunaCorePluginInterface::IPanelServices::ObjectEvaluationSettings)),
      m_watch(std::make_unique<ObjectEvaluationWatch>(backend))
{
  connect(m_watch.get(), &ObjectEvaluationWatch::changed, this, &VObjectEvaluationQml::changed);
}

VObjectEvaluationQml::~VObjectEvaluationQml() = default;

bool VObjectEvaluationQml::enabled() const
{
  bool enabled = false;
  return m_settings && m_settings->Enabled(enabled).Succeeded() && enabled;
}

double VObjectEvaluationQml::warningThreshold() const
{
  double threshold = 0;
  return m_settings && m_settings->WarningThreshold(threshold).Succeeded() ? threshold : 0;
}

double VObjectEvaluationQml::maximumStepCount() const
{
  std::uint64_t count = 0;
  return m_settings && m_settings->MaximumEvaluationStepCount(count).Succeeded() ? static_cast<double>(count) : 0;
}

VResultGadget VObjectEvaluationQml::setEnabled(bool enabled)
{
  return m_settings ? m_settings->SetEnabled(enabled) : IResult(EResult::NotAvailable);
}

VResultGadget VObjectEvaluationQml::setWarningThreshold(double distance)
{
  return m_settings ? m_settings->SetWarningThreshold(distance) : IResult(EResult::NotAvailable);
}

VResultGadget VObjectEvaluationQml::setMaximumStepCount(double count)
{
  if (!m_settings)
    return IResult(EResult::NotAvailable);
  if (!(count >= 1 && count <= greatestWholeNumber) || count != std::floor(count))
    return {EResult::InvalidValue, "The number of steps has to be a whole number above 0."};
  return m_settings->SetMaximumEvaluationStepCount(static_cast<std::uint64_t>(count));
}

}
