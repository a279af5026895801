#pragma once

#include "HostInterface/ISubjectCreator.h"

namespace Calibration
{

/// Makes general subjects from a labelling template and a skin. [any]
class VSubjectCreator final : public ISubjectCreator
{
public:
  /// The template says what is beneath the subject and whether it is labelled, the skin what it is used for and which
  /// model outputs it has; without a skin it is not solved. `InvalidName`, `AlreadyPresent`, also for the name of
  /// something beneath it; `InvalidArgument` without a template; `FileNotFound`, `FileIOFailure`,
  /// `SerialisationFailure`: the log tells where and why.
  NMX::IResult CreateSubject(NMX::IEntryEditor& access, const std::string& name,
                             const ISubjectTemplate& content) override;
  NMX::IResult ReadTemplate(const std::wstring& labellingTemplate, const std::wstring& skin,
                            std::shared_ptr<const ISubjectTemplate>& content) const override;
};

}
