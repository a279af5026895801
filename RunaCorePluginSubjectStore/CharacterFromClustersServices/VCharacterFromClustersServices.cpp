#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/VCharacterFromClustersServices.h"

#include "HostInterface/NMX/FileWork.h"
#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/CharacterWarnings.h"
#include "RunaCorePluginSubjectStore/Subjects/NameCheck.h"
#include "RunaCorePluginSubjectStore/Subjects/NewCharacter.h"
#include "RunaCorePluginSubjectStore/Subjects/Slots.h"
#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"
#include "RunaCorePluginSubjectStore/Subjects/Warnings.h"
#include "StoreInterface/CalibrationState.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/WideText.h"

#include <filesystem>
#include <limits>
#include <system_error>
#include <utility>

namespace CharacterFromClustersServices
{

using NMX::EResult;
using NMX::IResult;
using NMX::TSubjectStoreId;
using Subjects::MustBeCharacter;
namespace Paths = NMX::Paths;

namespace
{

constexpr auto kind = NMX::ESubjectKind::CharactersFromClusters;

/// A path from a client that the file system can be asked about.
bool IsPath(const std::string& text)
{
  return text.find('\0') == std::string::npos && NMX::ToWide(text).has_value();
}

bool Exists(const std::filesystem::path& file)
{
  std::error_code error;
  return exists(std::filesystem::status(file, error));
}

}

VCharacterFromClustersServices::VCharacterFromClustersServices(std::shared_ptr<ICharacterControls> controls,
                                                               std::shared_ptr<NMX::IStore> store)
    : m_controls(std::move(controls)), m_store(std::move(store))
{
}

IResult VCharacterFromClustersServices::CharacterList(std::set<std::string>& names) const
{
  return Subjects::ListNames(*m_store, kind, "Failed to read subject name for store id %1%", names);
}

IResult VCharacterFromClustersServices::CreateCharacter(const std::string& characterName,
                                                        const std::string& templatePath)
{
  return Subjects::Guarded(
      [&]() -> IResult
      {
        if (!m_controls)
          return EResult::NotSupported;
        if (const IResult checked = Subjects::CheckNewName(characterName); checked.Failed())
          return checked;
        if (!IsPath(templatePath))
          return EResult::InvalidArgument;
        TSubjectStoreId id;
        return Subjects::CreateCharacter(*m_store, *m_controls, characterName, templatePath, id);
      });
}

IResult VCharacterFromClustersServices::RemoveCharacter(const std::string& characterName)
{
  return Subjects::EditSubject(*m_store, characterName, MustBeCharacter,
                               [](NMX::IEntryEditor& editor, TSubjectStoreId id) { return editor.Remove(id); });
}

IResult VCharacterFromClustersServices::RemoveAllCharacters()
{
  return Subjects::EditAll(*m_store, kind, Subjects::EOnFailure::GoOn,
                           [](NMX::IEntryEditor& editor, TSubjectStoreId id) { return editor.Remove(id); });
}

IResult VCharacterFromClustersServices::CalibrateCharacter(const std::string& characterName)
{
  return Subjects::EditSubject(*m_store, characterName, MustBeCharacter,
                               [&](NMX::IEntryEditor& editor, TSubjectStoreId id) -> IResult
                               { return m_controls ? m_controls->Calibrate(editor, id) : EResult::NotSupported; });
}

IResult VCharacterFromClustersServices::ClearCharacterCalibration(const std::string& characterName)
{
  return Subjects::EditSubject(
      *m_store, characterName, MustBeCharacter, [&](NMX::IEntryEditor& editor, TSubjectStoreId id) -> IResult
      { return m_controls ? m_controls->ClearCalibration(editor, id) : EResult::NotSupported; });
}

IResult VCharacterFromClustersServices::CharacterCalibrationState(const std::string& characterName,
                                                                  ECharacterCalibrationState& calibrationState) const
{
  std::int32_t state = 0;
  const IResult read = Subjects::ReadEntry(*m_store, characterName, MustBeCharacter, Paths::Calibration(), state);
  if (read.Failed())
    return read;
  switch (state)
  {
  case NMX::CalibrationState::running:
    calibrationState = ECharacterCalibrationState::Calibrating;
    break;
  case NMX::CalibrationState::done:
    calibrationState = ECharacterCalibrationState::Calibrated;
    break;
  default:
    calibrationState = ECharacterCalibrationState::Uncalibrated;
  }
  return read;
}

IResult VCharacterFromClustersServices::CharacterEnabled(const std::string& characterName, bool& enabled) const
{
  return Subjects::ReadEntry(*m_store, characterName, MustBeCharacter, Paths::Enabled(), enabled);
}

IResult VCharacterFromClustersServices::SetCharacterEnabled(const std::string& characterName, bool enabled)
{
  return Subjects::WriteEntry(*m_store, characterName, MustBeCharacter, Paths::Enabled(), enabled);
}

IResult VCharacterFromClustersServices::SetAllCharactersEnabled(bool enabled)
{
  return Subjects::EditAll(*m_store, kind, Subjects::EOnFailure::Stop,
                           [enabled](NMX::IEntryEditor& editor, TSubjectStoreId id)
                           { return editor.SetValue(id, Paths::Enabled(), enabled); });
}

IResult VCharacterFromClustersServices::CharacterRetargetPath(const std::string& characterName,
                                                              std::string& retargetPath) const
{
  return Subjects::ReadSubject(*m_store, characterName, MustBeCharacter,
                               [&](const NMX::IStoreReader& reader, TSubjectStoreId id) -> IResult
                               {
                                 std::wstring path;
                                 if (const IResult read = NMX::Read(reader, id, Paths::Retarget(), path); read.Failed())
                                   return read;
                                 auto text = path.size() <= std::numeric_limits<std::int32_t>::max() ? NMX::ToUtf8(path)
                                                                                                     : std::nullopt;
                                 if (!text)
                                   return EResult::InvalidValue;
                                 retargetPath = std::move(*text);
                                 return EResult::Ok;
                               });
}

IResult VCharacterFromClustersServices::SetCharacterRetargetPath(const std::string& characterName,
                                                                 const std::string& retargetPath)
{
  // The character is found before the path is looked at, and no edit is open meanwhile.
  if (const IResult found =
          Subjects::ReadSubject(*m_store, characterName, MustBeCharacter,
                                [](const NMX::IStoreReader&, TSubjectStoreId) -> IResult { return EResult::Ok; });
      found.Failed())
    return found;
  return Subjects::Guarded(
      [&]() -> IResult
      {
        if (!IsPath(retargetPath))
          return EResult::InvalidArgument;
        if (!retargetPath.empty())
          if (const auto there = NMX::LookAtFile(retargetPath, &Exists); !there || !*there)
            return EResult::FileNotFound;
        return Subjects::WriteEntry(*m_store, characterName, MustBeCharacter, Paths::Retarget(),
                                    NMX::ToWide(retargetPath).value());
      });
}

IResult VCharacterFromClustersServices::SlotNames(const std::string& characterName,
                                                  std::vector<std::string>& slotNames) const
{
  std::vector<NMX::Slot> slots;
  const IResult read = Subjects::ReadEntry(*m_store, characterName, MustBeCharacter, Paths::Slots(), slots);
  if (read.Failed())
    return read;
  return Subjects::Guarded(
      [&]() -> IResult
      {
        std::vector<std::string> names;
        names.reserve(slots.size());
        for (NMX::Slot& slot : slots)
          names.push_back(std::move(slot.name));
        slotNames = std::move(names);
        return EResult::Ok;
      });
}

IResult VCharacterFromClustersServices::SlotObject(const std::string& characterName, std::uint32_t slotIndex,
                                                   std::string& objectName) const
{
  return Subjects::ReadSubject(
      *m_store, characterName, MustBeCharacter,
      [&](const NMX::IStoreReader& reader, TSubjectStoreId id) -> IResult
      {
        NMX::Slot slot;
        if (const IResult found = Subjects::FindSlot(reader, id, slotIndex, slot); found.Failed())
          return found;
        TSubjectStoreId object;
        if (const IResult found = Subjects::FindSlotObject(reader, id, slot.id, object); found.Failed())
          return found;
        if (object.Valid())
          return NMX::Read(reader, object, Paths::Name(), objectName);
        objectName.clear();
        return EResult::Ok;
      });
}

IResult VCharacterFromClustersServices::SetSlotObject(const std::string& characterName, std::uint32_t slotIndex,
                                                      const std::string& objectName)
{
  return Subjects::EditSubject(
      *m_store, characterName, MustBeCharacter,
      [&](NMX::IEntryEditor& editor, TSubjectStoreId id) -> IResult
      {
        NMX::Slot slot;
        if (const IResult found = Subjects::FindSlot(editor, id, slotIndex, slot); found.Failed())
          return found;
        TSubjectStoreId object;
        if (!objectName.empty())
          if (const IResult found = Subjects::FindSubject(editor, objectName, Subjects::MustBeObject, object);
              found.Failed())
            return found == EResult::InvalidArgument ? IResult(EResult::InvalidType) : found;
        return Subjects::FillSlot(editor, id, slot.id, object);
      });
}

IResult VCharacterFromClustersServices::CharacterWarnings(const std::string& name,
                                                          std::map<ECharacterWarning, std::string>& warnings) const
{
  static const Subjects::WarningEntries entries(NMX::characterWarnings, "SlotObjectWarning",
                                                Paths::WarningCFCChildWarning());
  return Subjects::ReadSubject(*m_store, name, MustBeCharacter, [&](const NMX::IStoreReader& reader, TSubjectStoreId id)
                               { return entries.ReadActive(reader, id, warnings); });
}

std::shared_ptr<NMX::ICharacterFromClustersServices::ChangedCallback>
VCharacterFromClustersServices::CharacterChangedCallback()
{
  return m_store->SubjectsChanged(kind);
}

}
