#pragma once

#include <optional>
#include <span>
#include <string_view>

namespace SubjectStoreUI
{

/// A kind of warning that a subject can carry.
struct WarningType
{
  std::string_view key; ///< the name of its store entry, beneath that of the group
  /// The sentence that counts the subjects: %1 is the count, %2 the ending of the verb. Empty for what the panel does
  /// not count.
  std::string_view sentence;
  std::string_view ofOne; ///< the sentence about one subject that has it
};

/// Every warning type at the index that is its type id. Index 0 is the group "Warnings" itself, under which the store
/// has the entries of all the others.
[[nodiscard]] std::span<const WarningType> WarningTypes();

/// The sentence of a type; empty when it has none, or when there is no such type.
[[nodiscard]] std::string_view WarningSentence(int typeId);

[[nodiscard]] std::optional<int> WarningTypeId(std::string_view key);

}
