#include "StandaloneHost/Files/SubjectConfiguration.h"

#include "StandaloneHost/Files/ConfigurationParser.h"
#include "StandaloneHost/Files/ConfigurationWriter.h"

#include <string>

namespace Files
{

ConfigurationCounts LoadSubjectConfigurations(NMX::IStore& store, std::span<const std::filesystem::path> files)
{
  ConfigurationContent content;
  for (const std::filesystem::path& file : files)
    ParseConfiguration(file, content);

  const auto editor = store.Editor();
  WriteConfiguration(content, *editor);
  if (const NMX::IResult committed = editor->Commit(); committed.Failed())
    throw ConfigurationError("the store cannot keep the subject configuration: " + std::string(committed.Name()));
  return {content.devices.size(), content.presets.size(), content.subjects.size()};
}

}
