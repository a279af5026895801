#pragma once

#include "HostInterface/ICharacterControls.h"
#include "HostInterface/NMX/VShared.h"
#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/ICharacterFromClustersServices.h"
#include "StoreInterface/IStore.h"

namespace CharacterFromClustersServices
{

/// The remote group "CharacterFromClustersServices" over the host's store. Keeps nothing: each answer is read at the
/// time of the call. Its host may have no character controls. [any]
class VCharacterFromClustersServices : public NMX::ICharacterFromClustersServices, public NMX::VShared
{
public:
  VCharacterFromClustersServices(std::shared_ptr<ICharacterControls> controls, std::shared_ptr<NMX::IStore> store);

  NMX::IResult CharacterList(std::set<std::string>& names) const override;
  NMX::IResult CreateCharacter(const std::string& characterName, const std::string& templatePath) override;
  NMX::IResult RemoveCharacter(const std::string& characterName) override;
  NMX::IResult RemoveAllCharacters() override;
  NMX::IResult CalibrateCharacter(const std::string& characterName) override;
  NMX::IResult ClearCharacterCalibration(const std::string& characterName) override;
  NMX::IResult CharacterCalibrationState(const std::string& characterName,
                                         ECharacterCalibrationState& calibrationState) const override;
  NMX::IResult CharacterEnabled(const std::string& characterName, bool& enabled) const override;
  NMX::IResult SetCharacterEnabled(const std::string& characterName, bool enabled) override;
  NMX::IResult SetAllCharactersEnabled(bool enabled) override;
  NMX::IResult CharacterRetargetPath(const std::string& characterName, std::string& retargetPath) const override;
  NMX::IResult SetCharacterRetargetPath(const std::string& characterName, const std::string& retargetPath) override;
  NMX::IResult SlotNames(const std::string& characterName, std::vector<std::string>& slotNames) const override;
  NMX::IResult SlotObject(const std::string& characterName, std::uint32_t slotIndex,
                          std::string& objectName) const override;
  NMX::IResult SetSlotObject(const std::string& characterName, std::uint32_t slotIndex,
                             const std::string& objectName) override;
  NMX::IResult CharacterWarnings(const std::string& name,
                                 std::map<ECharacterWarning, std::string>& warnings) const override;
  std::shared_ptr<ChangedCallback> CharacterChangedCallback() override;

private:
  const std::shared_ptr<ICharacterControls> m_controls;
  const std::shared_ptr<NMX::IStore> m_store;
};

}
