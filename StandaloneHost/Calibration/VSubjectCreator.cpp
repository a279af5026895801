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

IResult VSubjectCreator::CreateSubject(NMX::IEntryEditor& access, const std::string& name,
                                       const std::wstring& labellingTemplate, const std::wstring& skin)
{
  TSubjectStoreId subject;
  if (const IResult added = access.Add(NMX::ESubjectKind::GeneralSubjects, name, subject); added.Failed())
    return added;
  LabellingTemplate labelling;
  if (const IResult read =
          Files::TryRead("labelling template", PathOf(labellingTemplate), &ReadLabellingTemplate, labelling);
      read.Failed())
    return read;
  SubjectSkin solving;
  solving.solving = false;
  if (!skin.empty())
    if (const IResult read = Files::TryRead("subject skin", PathOf(skin), &ReadSubjectSkin, solving); read.Failed())
      return read;
  const std::pair<NMX::EntryPath, NMX::Value> entries[] = {
      {Paths::FilePath(), labellingTemplate},   {Paths::RoleLabelling(), labelling.labelling},
      {Paths::RoleSolving(), solving.solving},  {Paths::RoleRetargeting(), solving.retargeting},
      {Paths::ModelOutputCGM2(), solving.cgm2}, {Paths::ModelOutputPluginKinex(), solving.pluginKinex}};
  for (const auto& [path, value] : entries)
    if (const IResult set = access.SetValue(subject, path, value); set.Failed())
      return set;
  return AddChildren(access, subject, name, labelling);
}

}
