#include "RunaCorePluginSubjectStore/Catalogue/CharacterFromClustersCatalogue.h"

#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/CharacterWarnings.h"

namespace Catalogue
{

using NMX::ICharacterFromClustersServices;
using TerminalServer2::Callback;
using TerminalServer2::ELevel;
using TerminalServer2::Function;

namespace
{

constexpr const TerminalServer2::TypeRecord* types[] = {&NMX::characterWarnings, &NMX::characterCalibrationStates};

constexpr TerminalServer2::FunctionRow<ICharacterFromClustersServices> functions[] = {
    Function<&ICharacterFromClustersServices::CharacterList>(
        "CharacterFromClustersServices.CharacterList", "The list of loaded character names.",
        {{"Names", "List of character names."}}, "Ok - On success."),
    Function<&ICharacterFromClustersServices::CreateCharacter>(
        "CharacterFromClustersServices.CreateCharacter", "Create a character from clusters.",
        {{"CharacterName", "Name of character."}, {"TemplatePath", "Absolute path to character template file."}},
        "Ok - On success.\n"
        "AlreadyPresent - A character with that name already exists.\n"
        "FileIOFailure - Template file could not be read.\n"
        "FileNotFound - Template path did not exist.\n"
        "InvalidArgument - Template path was empty.\n"
        "InvalidName - Character name is not valid.\n"
        "SerializationFailure - Template file could not be parsed"),
    Function<&ICharacterFromClustersServices::RemoveCharacter>(
        "CharacterFromClustersServices.RemoveCharacter", "Remove a character.",
        {{"CharacterName", "Name of character."}},
        "Ok - On success.\n"
        "NotSupported - Name exists but is not a character.\n"
        "NotFound - No character with that name."),
    Function<&ICharacterFromClustersServices::RemoveAllCharacters>(
        "CharacterFromClustersServices.RemoveAllCharacters", "Remove all characters.", "Ok - On success."),
    Function<&ICharacterFromClustersServices::CalibrateCharacter>(
        "CharacterFromClustersServices.CalibrateCharacter",
        "Calibrate a character (adjust skeleton to fit the person, based on tracked object poses).",
        {{"CharacterName", "Name of character."}},
        "Ok - On success.\n"
        "NotSupported - Name exists but is not a character.\n"
        "NotFound - No character with that name."),
    Function<&ICharacterFromClustersServices::ClearCharacterCalibration>(
        "CharacterFromClustersServices.ClearCharacterCalibration",
        "Clear a character calibration (return skeleton to default state).", {{"CharacterName", "Name of character."}},
        "Ok - On success.\n"
        "NotSupported - Name exists but is not a character.\n"
        "NotFound - No character with that name."),
    Function<&ICharacterFromClustersServices::CharacterCalibrationState>(
        "CharacterFromClustersServices.CharacterCalibrationState", "Get the calibration state of a character.",
        {{"CharacterName", "Name of character."}, {"CalibrationState", "Calibration state of character."}},
        "Ok - On success.\n"
        "NotSupported - Name exists but is not a character.\n"
        "NotFound - No character with that name."),
    Function<&ICharacterFromClustersServices::CharacterEnabled>(
        "CharacterFromClustersServices.CharacterEnabled", "Get the enable state of a character.",
        {{"CharacterName", "Name of character."}, {"Enabled", "If character is enabled."}},
        "Ok - On success.\n"
        "NotSupported - Name exists but is not a character.\n"
        "NotFound - No character with that name."),
    Function<&ICharacterFromClustersServices::SetCharacterEnabled>(
        "CharacterFromClustersServices.SetCharacterEnabled", "Enable or disable a character.",
        {{"CharacterName", "Name of character."}, {"Enabled", "If character should be enabled."}},
        "Ok - On success.\n"
        "NotSupported - Name exists but is not a character.\n"
        "NotFound - No character with that name."),
    Function<&ICharacterFromClustersServices::SetAllCharactersEnabled>(
        "CharacterFromClustersServices.SetAllCharactersEnabled", "Enable or disable all characters.",
        {{"Enabled", "If characters should be enabled."}}, "Ok - On success."),
    Function<&ICharacterFromClustersServices::CharacterRetargetPath>(
        "CharacterFromClustersServices.CharacterRetargetPath", "Get the path to a character's retarget file.",
        {{"CharacterName", "Name of character."}, {"RetargetPath", "Absolute path to a retarget file."}},
        "Ok - On success.\n"
        "NotSupported - Name exists but is not a character.\n"
        "NotFound - No character with that name."),
    Function<&ICharacterFromClustersServices::SetCharacterRetargetPath>(
        "CharacterFromClustersServices.SetCharacterRetargetPath", "Set the path to a character's retarget file.",
        {{"CharacterName", "Name of character."},
         {"RetargetPath",
          "Absolute path to retarget file. This path must be accessible from the remote host. An empty path is "
          "also accepted, which will set the retarget to None."}},
        "Ok - On success.\n"
        "NotSupported - Name exists but is not a character.\n"
        "NotFound - No character with that name.\n"
        "FileNotFound - If the template path did not correspond to a file."),
    Function<&ICharacterFromClustersServices::SlotNames>(
        "CharacterFromClustersServices.SlotNames", "Get the names of the slots in a character.",
        {{"CharacterName", "Name of character."}, {"SlotNames", "Names of character slots."}},
        "Ok - On success.\n"
        "NotFound - No character with that name."),
    Function<&ICharacterFromClustersServices::SlotObject>(
        "CharacterFromClustersServices.SlotObject", "Get the object assigned to a character slot (if any).",
        {{"CharacterName", "Name of character."},
         {"SlotIndex", "Index of slot."},
         {"ObjectName", "Name of object assigned to slot."}},
        "Ok - On success.\n"
        "InvalidIndex - No slot with that index.\n"
        "NotFound - No character with that name."),
    Function<&ICharacterFromClustersServices::SetSlotObject>(
        "CharacterFromClustersServices.SetSlotObject",
        "Set the object assigned to a character slot. Supplying an empty name will clear the slot.",
        {{"CharacterName", "Name of character."},
         {"SlotIndex", "Index of slot."},
         {"ObjectName", "Name of object to assign to slot."}},
        "Ok - On success.\n"
        "InvalidIndex - No slot with that index.\n"
        "InvalidType - Object name does not correspond to an object.\n"
        "NotFound - No character or object with that name."),
    Function<&ICharacterFromClustersServices::CharacterWarnings>(
        "CharacterFromClustersServices.CharacterWarnings", "Get any warnings associated with a character.",
        {{"Name", "Name of the character."}, {"Warnings", "Active warning types and descriptions for the character."}},
        "Ok - On success.\n"
        "NotFound - If the character name supplied is invalid.")};

constexpr TerminalServer2::CallbackRow<ICharacterFromClustersServices> callbacks[] = {
    Callback<&ICharacterFromClustersServices::CharacterChangedCallback>(
        "CharacterFromClustersServices.CharacterChangedCallback",
        "Callback issued whenever any character changes. This includes addition/removal of characters and character "
        "property changes.")};

}

const TerminalServer2::GroupTable<ICharacterFromClustersServices>& CharacterFromClustersGroup()
{
  static constexpr TerminalServer2::GroupTable<ICharacterFromClustersServices> table{
      {"CharacterFromClustersServices", "Functions for controlling characters tracked from clusters.", {}},
      types,
      ELevel::Open,
      functions,
      callbacks};
  return table;
}

}
