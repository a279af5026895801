#include "StandaloneHost/FileIO/TemplateExport.h"

#include "StandaloneHost/Calibration/LabellingTemplateFile.h"
#include "StandaloneHost/Characters/TemplateFile.h"
#include "StandaloneHost/Files/WholeFile.h"
#include "StandaloneHost/SmartObjects/TemplateFile.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"
#include "StoreInterface/WideText.h"

#include <string>
#include <utility>
#include <vector>

namespace FileIO
{

using NMX::EResult;
using NMX::ESubjectKind;
using NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

void Check(NMX::IResult result)
{
  if (result == EResult::InvalidId)
    throw Files::ConfigurationError("there is no such subject", result);
  if (result.Failed())
    throw Files::ConfigurationError("the subject cannot be read: " + std::string(result.Name()), result);
}

/// An entry that has no value is as one that is empty.
template <class T>
T Get(const NMX::IStoreReader& reader, TSubjectStoreId id, NMX::EntryPath path)
{
  T value{};
  const NMX::IResult read = NMX::Read(reader, id, path, value);
  Check(read == EResult::NotSet ? NMX::IResult(EResult::Ok) : read);
  return value;
}

template <class Content>
void WriteTemplate(const std::filesystem::path& file, const Content& content, std::string (*textOf)(const Content&),
                   Content (*read)(const std::filesystem::path&))
{
  Files::WriteWholeFile(file, textOf(content),
                        [&](const std::filesystem::path& written)
                        {
                          if (read(written) != content)
                            throw Files::ConfigurationError("it holds something else than the subject");
                        });
}

SmartObjects::SmartObjectTemplate SmartObject(const NMX::IStoreReader& reader, TSubjectStoreId id)
{
  SmartObjects::SmartObjectTemplate content;
  for (NMX::SmartCluster& cluster : Get<std::vector<NMX::SmartCluster>>(reader, id, Paths::SmartClusters()))
    content.clusters.push_back({std::move(cluster.label), std::move(cluster.type)});
  content.additionalMarkers = Get<std::vector<NMX::Position>>(reader, id, Paths::AdditionalMarkerPositions());
  return content;
}

Characters::CharacterTemplate Character(const NMX::IStoreReader& reader, TSubjectStoreId id)
{
  Characters::CharacterTemplate content;
  for (const NMX::Slot& slot : Get<std::vector<NMX::Slot>>(reader, id, Paths::Slots()))
  {
    const std::string root = content.segments.empty() ? std::string{} : content.segments.front().name;
    content.segments.push_back({slot.name, root});
    content.slots.push_back({slot.name, slot.name});
  }
  content.solving = Get<bool>(reader, id, Paths::RoleSolving());
  content.retargeting = Get<bool>(reader, id, Paths::RoleRetargeting());
  return content;
}

/// Adds what a labelling template can say of what is beneath `parent`, which is called `parentName` in it.
void AddChildren(const NMX::IStoreReader& reader, TSubjectStoreId parent, const std::string& parentName,
                 const std::string& subjectName, std::vector<Calibration::ChildTemplate>& children)
{
  std::vector<TSubjectStoreId> ids;
  Check(reader.Children(parent, ids));
  for (const TSubjectStoreId id : ids)
  {
    ESubjectKind kind{};
    Check(reader.Kind(id, kind));
    if (kind != ESubjectKind::Props && kind != ESubjectKind::LabellingClusters)
      continue;
    // The subject's own name comes before it again when a subject is made.
    auto name = Get<std::string>(reader, id, Paths::Name());
    if (const std::string begin = subjectName + ' '; name.starts_with(begin))
      name.erase(0, begin.size());
    children.push_back({kind, name, parentName});
    AddChildren(reader, id, name, subjectName, children);
  }
}

/// What the store knows of a general subject: all but the segments.
struct GeneralSubject
{
  std::wstring madeFrom;
  Calibration::LabellingTemplate labelling;
};

GeneralSubject General(const NMX::IStoreReader& reader, TSubjectStoreId id)
{
  GeneralSubject subject{Get<std::wstring>(reader, id, Paths::FilePath()), {}};
  subject.labelling.labelling = Get<bool>(reader, id, Paths::RoleLabelling());
  AddChildren(reader, id, "", Get<std::string>(reader, id, Paths::Name()), subject.labelling.children);
  return subject;
}

Calibration::LabellingTemplate WithSegments(GeneralSubject subject)
{
  const std::filesystem::path madeFrom = NMX::ToUtf8(subject.madeFrom).value_or(std::string{});
  if (madeFrom.empty())
    throw Files::ConfigurationError("the subject was not made from a template, which would tell its segments",
                                    EResult::NotSupported);
  try
  {
    subject.labelling.segments = Calibration::ReadLabellingTemplate(madeFrom).segments;
  }
  catch (const Files::ConfigurationError& failure)
  {
    throw Files::ConfigurationError("the template that the subject was made from does not tell its segments: " +
                                        std::string(failure.what()),
                                    EResult::NotSupported);
  }
  return std::move(subject.labelling);
}

}

void ExportTemplate(const NMX::IStore& store, TSubjectStoreId subject, const std::filesystem::path& file)
{
  // Files can take their time: the store is not held meanwhile.
  auto reader = store.Reader();
  ESubjectKind kind{};
  Check(reader->Kind(subject, kind));
  switch (kind)
  {
  case ESubjectKind::SmartObjects:
  {
    const auto content = SmartObject(*reader, subject);
    reader.reset();
    return WriteTemplate(file, content, &SmartObjects::TemplateText, &SmartObjects::ReadTemplate);
  }
  case ESubjectKind::CharactersFromClusters:
  {
    const auto content = Character(*reader, subject);
    reader.reset();
    return WriteTemplate(file, content, &Characters::TemplateText, &Characters::ReadTemplate);
  }
  case ESubjectKind::GeneralSubjects:
  {
    auto content = General(*reader, subject);
    reader.reset();
    return WriteTemplate(file, WithSegments(std::move(content)), &Calibration::LabellingTemplateText,
                         &Calibration::ReadLabellingTemplate);
  }
  default:
    throw Files::ConfigurationError("no template makes a subject of kind " + std::string(NMX::KindKey(kind)),
                                    EResult::NotSupported);
  }
}

}
