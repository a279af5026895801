#include "StandaloneHost/Files/EntryTree.h"

#include "StandaloneHost/Files/ValueText.h"

#include <algorithm>
#include <array>

namespace Files
{

namespace
{

/// The lists have elements of their own.
bool Loadable(const Store::SchemaEntry& entry)
{
  switch (entry.type)
  {
  case NMX::EValueType::Positions:
  case NMX::EValueType::SmartClusters:
  case NMX::EValueType::Slots:
    return entry.writer == Store::EWriter::Anyone;
  default:
    return entry.writer == Store::EWriter::Anyone && HasText(entry.type);
  }
}

EntryNode& ChildToFill(EntryNode& node, std::string_view name)
{
  auto place = std::lower_bound(node.children.begin(), node.children.end(), name,
                                [](const EntryNode& child, std::string_view sought) { return child.name < sought; });
  if (place == node.children.end() || place->name != name)
    place = node.children.insert(place, {std::string(name), nullptr, {}});
  return *place;
}

EntryNode MakeTree(NMX::ESubjectKind kind)
{
  EntryNode root{std::string(NMX::KindKey(kind)), nullptr, {}};
  for (const Store::SchemaEntry& entry : Store::KindSchema::Of(kind).Entries())
  {
    if (!Loadable(entry))
      continue;
    EntryNode* node = &root;
    for (std::string_view rest = entry.path.Text(); !rest.empty();)
    {
      const std::string_view name = rest.substr(0, rest.find('/'));
      node = &ChildToFill(*node, name);
      rest.remove_prefix(std::min(name.size() + 1, rest.size()));
    }
    node->entry = &entry;
  }
  return root;
}

}

const EntryNode* EntryNode::Find(std::string_view child) const
{
  const auto found =
      std::find_if(children.begin(), children.end(), [child](const EntryNode& known) { return known.name == child; });
  return found != children.end() ? &*found : nullptr;
}

std::vector<std::string_view> EntryNode::ChildNames() const
{
  std::vector<std::string_view> names;
  for (const EntryNode& child : children)
    names.push_back(child.name);
  return names;
}

const EntryNode& EntriesOf(NMX::ESubjectKind kind)
{
  static const auto trees = []
  {
    std::array<EntryNode, NMX::allSubjectKinds.size()> made;
    for (const NMX::ESubjectKind each : NMX::allSubjectKinds)
      made[static_cast<std::size_t>(each)] = MakeTree(each);
    return made;
  }();
  return trees[static_cast<std::size_t>(kind)];
}

const EntryNode& PresetParameters()
{
  return *EntriesOf(NMX::ESubjectKind::BasicObjects).Find("Parameters");
}

}
