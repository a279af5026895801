#include "StandaloneHost/Calibration/SubjectSkinFile.h"

#include "StandaloneHost/Files/ElementParts.h"
#include "StandaloneHost/Files/ElementReader.h"

namespace Calibration
{

using Files::Element;
using Files::ElementReader;
using Files::EPresence;
using Files::TruthValue;

SubjectSkin ReadSubjectSkin(const std::filesystem::path& file)
{
  ElementReader xml(file, Files::maximumTemplateBytes);
  const Element root = Files::EnterFirstVersion(xml, "SubjectSkin");
  SubjectSkin content;
  const auto readRoles = [&](const Element& section)
  {
    Files::ReadSections(
        xml, section,
        {TruthValue(xml, "Solving", content.solving), TruthValue(xml, "Retargeting", content.retargeting)});
  };
  const auto readModelOutputs = [&](const Element& section)
  {
    Files::ReadSections(xml, section,
                        {TruthValue(xml, "CGM2", content.cgm2), TruthValue(xml, "PluginKinex", content.pluginKinex)});
  };
  Files::ReadSections(xml, root,
                      {{"Segments", EPresence::Required,
                        [&](const Element& section) { content.segments = Files::ReadSegments(xml, section); }},
                       {"Roles", EPresence::Optional, readRoles},
                       {"ModelOutputs", EPresence::Optional, readModelOutputs}});
  xml.End();
  return content;
}

}
