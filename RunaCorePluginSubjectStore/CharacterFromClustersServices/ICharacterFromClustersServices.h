#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/IResult.h"

#include <cstdint>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

namespace NMX
{

/// Characters built from clusters: slots that objects fill. The operations of the remote group
/// "CharacterFromClustersServices", in its order.
///
/// Where not said otherwise: a character is found by its name, `NotFound` when no subject has it and `NotSupported`
/// when another kind of subject does. A setter is done and kept when it returns `Ok` and has changed nothing otherwise.
/// [any]
class ICharacterFromClustersServices
{
public:
  enum class ECharacterWarning : std::uint32_t
  {
    SlotObjectWarning,
    NotCalibrated,
    CFCNoReferenceClusterAssigned,
    InsufficientAutoAssignCandidates
  };

  enum class ECharacterCalibrationState : std::uint32_t
  {
    Uncalibrated,
    Calibrating,
    Calibrated
  };

  using ChangedCallback = IMultiCallbackPostal<void()>;

  virtual ~ICharacterFromClustersServices() = default;

  virtual IResult CharacterList(std::set<std::string>& names) const = 0;

  /// Makes a character from a template file of the host. `InvalidName` when the name begins or ends with a space or
  /// does not match the store's name pattern, `AlreadyPresent` when a subject of any kind has it; `InvalidArgument` for
  /// an empty path, `FileNotFound`, `FileIOFailure`, `SerialisationFailure`; `NotSupported` in a host without
  /// characters.
  virtual IResult CreateCharacter(const std::string& characterName, const std::string& templatePath) = 0;

  /// The objects in its slots stay, in no slot.
  virtual IResult RemoveCharacter(const std::string& characterName) = 0;

  /// Removes all characters that can be removed.
  virtual IResult RemoveAllCharacters() = 0;

  /// Starts a calibration, afresh if one runs.
  virtual IResult CalibrateCharacter(const std::string& characterName) = 0;

  /// Forgets the calibration, and ends one that runs.
  virtual IResult ClearCharacterCalibration(const std::string& characterName) = 0;

  virtual IResult CharacterCalibrationState(const std::string& characterName,
                                            ECharacterCalibrationState& calibrationState) const = 0;

  virtual IResult CharacterEnabled(const std::string& characterName, bool& enabled) const = 0;
  virtual IResult SetCharacterEnabled(const std::string& characterName, bool enabled) = 0;

  /// Enables or disables all characters, or none when one refuses.
  virtual IResult SetAllCharactersEnabled(bool enabled) = 0;

  /// The path of the retarget file on the host; empty for none. `FileNotFound` for a path at which there is nothing,
  /// `InvalidArgument` for one that is not UTF-8 or holds a null character.
  virtual IResult CharacterRetargetPath(const std::string& characterName, std::string& retargetPath) const = 0;
  virtual IResult SetCharacterRetargetPath(const std::string& characterName, const std::string& retargetPath) = 0;

  virtual IResult SlotNames(const std::string& characterName, std::vector<std::string>& slotNames) const = 0;

  /// The name of the object in a slot; empty when the slot is. `InvalidIndex` when there are fewer slots.
  virtual IResult SlotObject(const std::string& characterName, std::uint32_t slotIndex,
                             std::string& objectName) const = 0;

  /// Puts an object, basic or smart, into a slot, out of the one that it was in; an empty name empties the slot.
  /// `InvalidIndex`, then `NotFound` for the object's name, `InvalidType` when it is not an object's.
  virtual IResult SetSlotObject(const std::string& characterName, std::uint32_t slotIndex,
                                const std::string& objectName) = 0;

  /// The warnings that hold, each with its text.
  virtual IResult CharacterWarnings(const std::string& name,
                                    std::map<ECharacterWarning, std::string>& warnings) const = 0;

  /// Raised whenever a character is added, removed or changed, also when an object comes into one of its slots, leaves
  /// it or is renamed there.
  virtual std::shared_ptr<ChangedCallback> CharacterChangedCallback() = 0;
};

}
