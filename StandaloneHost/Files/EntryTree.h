#pragma once

#include "StandaloneHost/Store/Schema.h"

#include <string>
#include <string_view>
#include <vector>

namespace Files
{

/// The entries that a configuration can give, as the tree that their paths make: a group of others, or an entry.
struct EntryNode
{
  std::string name;
  const Store::SchemaEntry* entry = nullptr; ///< null for a group
  std::vector<EntryNode> children;           ///< in ascending order of name

  /// Null when there is no such child.
  [[nodiscard]] const EntryNode* Find(std::string_view child) const;
  [[nodiscard]] std::vector<std::string_view> ChildNames() const;
};

/// The entries of a kind, without those that only the store writes and those of types that have no text. Built once.
/// [any]
[[nodiscard]] const EntryNode& EntriesOf(NMX::ESubjectKind kind);

/// The parameters that a preset can give: those of a basic object.
[[nodiscard]] const EntryNode& PresetParameters();

}
