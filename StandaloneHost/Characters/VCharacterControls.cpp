#include "StandaloneHost/Characters/VCharacterControls.h"

#include "StandaloneHost/Characters/TemplateFile.h"
#include "StandaloneHost/Files/ReadResult.h"
#include "StoreInterface/CalibrationState.h"
#include "StoreInterface/EntryPaths.h"

#include <utility>
#include <vector>

namespace Characters
{

using NMX::IResult;
using NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

struct VCharacterTemplate final : ICharacterTemplate
{
  explicit VCharacterTemplate(std::shared_ptr<const CharacterTemplate> file) : content(std::move(file)) {}

  const std::shared_ptr<const CharacterTemplate> content;
};

/// The template's slots, numbered from 1.
std::vector<NMX::Slot> SlotsOf(const CharacterTemplate& content)
{
  std::vector<NMX::Slot> slots;
  slots.reserve(content.slots.size());
  for (const SlotTemplate& slot : content.slots)
    slots.push_back({TSubjectStoreId(slots.size() + 1), slot.name});
  return slots;
}

}

VCharacterControls::VCharacterControls(std::shared_ptr<NMX::IStore> store,
                                       std::shared_ptr<NMX::IAsioPostalService> postal,
                                       std::chrono::milliseconds calibrationTime)
    : m_runs(std::make_shared<CalibrationRuns>(std::move(store), std::move(postal), calibrationTime))
{
  m_runs->Resume();
}

void VCharacterControls::Stop()
{
  m_runs->Stop();
}

IResult VCharacterControls::ReadTemplate(const std::filesystem::path& file,
                                         std::shared_ptr<const ICharacterTemplate>& content) const
{
  std::shared_ptr<const CharacterTemplate> fromFile;
  const IResult read = Files::Read<&Characters::ReadTemplate>("character template", file, fromFile);
  if (read.Succeeded())
    content = std::make_shared<VCharacterTemplate>(std::move(fromFile));
  return read;
}

IResult VCharacterControls::CreateFromTemplate(NMX::IEntryEditor& access, const std::string& name,
                                               const ICharacterTemplate& fromTemplate)
{
  const auto* read = dynamic_cast<const VCharacterTemplate*>(&fromTemplate);
  if (read == nullptr)
    return NMX::EResult::InvalidType;
  const CharacterTemplate& content = *read->content;
  TSubjectStoreId id;
  if (const IResult added = access.Add(NMX::ESubjectKind::CharactersFromClusters, name, id); added.Failed())
    return added;
  if (const IResult set = access.SetValue(id, Paths::Slots(), SlotsOf(content)); set.Failed())
    return set;
  if (const IResult set = access.SetValue(id, Paths::RoleSolving(), content.solving); set.Failed())
    return set;
  return access.SetValue(id, Paths::RoleRetargeting(), content.retargeting);
}

IResult VCharacterControls::Calibrate(NMX::IEntryEditor& access, TSubjectStoreId character)
{
  const IResult set = access.SetValue(character, Paths::Calibration(), NMX::CalibrationState::running);
  if (set.Succeeded())
    m_runs->Start(character); // if the caller does not commit, the run ends without effect
  return set;
}

IResult VCharacterControls::ClearCalibration(NMX::IEntryEditor& access, TSubjectStoreId character)
{
  // A run that finds the state cleared ends without effect.
  return access.SetValue(character, Paths::Calibration(), NMX::CalibrationState::none);
}

}
