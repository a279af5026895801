#pragma once

#include "StandaloneHost/Store/SubjectRecord.h"

#include <memory>
#include <string>
#include <string_view>

namespace Store
{

/// The entries of a record that differ from their initial value, as a JSON object of path and value. What is derived
/// (id, name, children) is left out.
[[nodiscard]] std::string RecordToText(const SubjectRecord& record);

/// Reads such a text into a new record. Throws std::runtime_error that says what is wrong.
[[nodiscard]] std::unique_ptr<SubjectRecord> RecordFromText(NMX::TSubjectStoreId id, NMX::ESubjectKind kind,
                                                            std::string name, std::string_view text);

/// A value of any type, with its type, as JSON; and back.
[[nodiscard]] std::string ValueToText(const NMX::Value& value);
[[nodiscard]] NMX::Value ValueFromText(std::string_view text);

}
