#pragma once

#include "HostInterface/NMX/IResult.h"
#include "HostInterface/TerminalServer2/Records.h"
#include "StoreInterface/IStoreReader.h"

#include <map>
#include <string>
#include <vector>

namespace Subjects
{

/// The store entry of each value of a warning enumeration, in the order of its table.
class WarningEntries
{
public:
  /// A value named X stands for the entry "Warnings/WarningX".
  explicit WarningEntries(const TerminalServer2::TypeRecord& enumeration);

  /// The same, but the value named `exception` stands for `entry`.
  WarningEntries(const TerminalServer2::TypeRecord& enumeration, std::string_view exception, NMX::EntryPath entry);

  /// The values whose entry is true for the subject, each with its text.
  template <class E>
  NMX::IResult ReadActive(const NMX::IStoreReader& reader, NMX::TSubjectStoreId id,
                          std::map<E, std::string>& warnings) const
  {
    std::map<E, std::string> active;
    for (const Entry& entry : m_entries)
    {
      bool holds = false;
      if (const NMX::IResult read = ReadOne(reader, id, entry.path, holds); read.Failed())
        return read;
      if (holds)
        active.emplace(static_cast<E>(entry.value->number), entry.value->text);
    }
    warnings = std::move(active);
    return NMX::EResult::Ok;
  }

private:
  struct Entry
  {
    const TerminalServer2::EnumerationValue* value;
    NMX::EntryPath path;
  };

  static NMX::IResult ReadOne(const NMX::IStoreReader& reader, NMX::TSubjectStoreId id, NMX::EntryPath path,
                              bool& holds);

  std::vector<Entry> m_entries;
};

}
