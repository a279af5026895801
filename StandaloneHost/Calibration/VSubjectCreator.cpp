#include "StandaloneHost/Calibration/VSubjectCreator.h"

#include "StandaloneHost/Calibration/LabellingTemplateFile.h"
#include "StandaloneHost/Calibration/SubjectSkinFile.h"
#include "StandaloneHost/Files/ReadResult.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/IEntryEditor.h"
#include "StoreInterface/WideText.h"

#include <map>
#include <utility>

namespace Calibration
{

using NMX::EResult;
using NMX::IResult;
using NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

struct VSubjectTemplate final : ISubjectTemplate
{
  std::wstring file;
  std::shared_ptr<const LabellingTemplate> labelling;
  std::shared_ptr<const SubjectSkin> skin;
};

/// Empty for what is no path.
std::filesystem::path PathOf(const std::wstring& text)
{
  return NMX::ToUtf8(text).value_or(std::string{});
}

/// Adds what the template has beneath the subject, each named after the subject.
IResult AddChildren(NMX::IEntryEditor& access, TSubjectStoreId subject, const std::string& name,
                    const LabellingTemplate& labelling)
{
  std::map<std::string, TSubjectStoreId> added{{"", subject}};
  for (const ChildTemplate& child : labelling.children)
  {
    TSubjectStoreId id;
    if (const IResult made = access.Add(child.kind, name + ' ' + child.name, id); made.Failed())
      return made;
    if (const IResult set = access.SetValue(id, Paths::ParentSubjectId(), added.at(child.parent)); set.Failed())
      return set;
    added.emplace(child.name, id);
  }
  return EResult::Ok;
}

}

IResult VSubjectCreator::ReadTemplate(const std::wstring& labellingTemplate, const std::wstring& skin,
                                      std::shared_ptr<const ISubjectTemplate>& content) const
{
  const auto files = std::make_shared<VSubjectTemplate>();
  files->file = labellingTemplate;
  if (const IResult read =
          Files::Read<&ReadLabellingTemplate>("labelling template", PathOf(labellingTemplate), files->labelling);
      read.Failed())
    return read;
  if (skin.empty())
  {
    SubjectSkin none;
    none.solving = false;
    files->skin = std::make_shared<const SubjectSkin>(std::move(none));
  }
  else if (const IResult read = Files::Read<&ReadSubjectSkin>("subject skin", PathOf(skin), files->skin); read.Failed())
    return read;
  content = files;
  return EResult::Ok;
}

IResult VSubjectCreator::CreateSubject(NMX::IEntryEditor& access, const std::string& name,
                                       const ISubjectTemplate& content)
{
  const auto* files = dynamic_cast<const VSubjectTemplate*>(&content);
  if (files == nullptr)
    return EResult::InvalidType;
  const LabellingTemplate& labelling = *files->labelling;
  const SubjectSkin& solving = *files->skin;
  TSubjectStoreId subject;
  if (const IResult added = access.Add(NMX::ESubjectKind::GeneralSubjects, name, subject); added.Failed())
    return added;
  const std::pair<NMX::EntryPath, NMX::Value> entries[] = {
      {Paths::FilePath(), files->file},         {Paths::RoleLabelling(), labelling.labelling},
      {Paths::RoleSolving(), solving.solving},  {Paths::RoleRetargeting(), solving.retargeting},
      {Paths::ModelOutputCGM2(), solving.cgm2}, {Paths::ModelOutputPluginKinex(), solving.pluginKinex}};
  for (const auto& [path, value] : entries)
    if (const IResult set = access.SetValue(subject, path, value); set.Failed())
      return set;
  return AddChildren(access, subject, name, labelling);
}

}
