#include "RunaCorePluginSubjectStore/Subjects/Warnings.h"

#include "StoreInterface/TypedAccess.h"

namespace Subjects
{

WarningEntries::WarningEntries(const TerminalServer2::TypeRecord& enumeration)
{
  m_entries.reserve(enumeration.values.size());
  for (const auto& value : enumeration.values)
    m_entries.push_back({&value, NMX::EntryPath("Warnings/Warning" + std::string(value.name))});
}

WarningEntries::WarningEntries(const TerminalServer2::TypeRecord& enumeration, std::string_view exception,
                               NMX::EntryPath entry)
{
  m_entries.reserve(enumeration.values.size());
  for (const auto& value : enumeration.values)
    m_entries.push_back(
        {&value, value.name == exception ? entry : NMX::EntryPath("Warnings/Warning" + std::string(value.name))});
}

NMX::IResult WarningEntries::ReadOne(const NMX::IStoreReader& reader, NMX::TSubjectStoreId id, NMX::EntryPath path,
                                     bool& holds)
{
  return NMX::Read(reader, id, path, holds);
}

}
