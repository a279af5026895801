#pragma once

#include "HostInterface/ICharacterControls.h"
#include "StandaloneHost/Characters/CalibrationRuns.h"

namespace Characters
{

/// Makes the standalone host's characters from templates and calibrates them. [any]
class VCharacterControls final : public ICharacterControls
{
public:
  /// A calibration takes `calibrationTime`; one that the store has as running goes on.
  VCharacterControls(std::shared_ptr<NMX::IStore> store, std::shared_ptr<NMX::IAsioPostalService> postal,
                     std::chrono::milliseconds calibrationTime);

  /// Cancels what runs, so that nothing edits the store any more. What is cut short goes on at the next start. [host]
  void Stop();

  NMX::IResult CreateFromTemplate(NMX::IEntryEditor& access, const std::string& name,
                                  const ICharacterTemplate& fromTemplate) override;
  NMX::IResult Calibrate(NMX::IEntryEditor& access, NMX::TSubjectStoreId character) override;
  NMX::IResult ClearCalibration(NMX::IEntryEditor& access, NMX::TSubjectStoreId character) override;
  NMX::IResult ReadTemplate(const std::filesystem::path& file,
                            std::shared_ptr<const ICharacterTemplate>& content) const override;

private:
  const std::shared_ptr<CalibrationRuns> m_runs;
};

}
