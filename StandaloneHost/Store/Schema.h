#pragma once

#include "StoreInterface/EntryPath.h"
#include "StoreInterface/IStoreReader.h"
#include "StoreInterface/SubjectKind.h"
#include "StoreInterface/Value.h"

#include <cstdint>
#include <span>
#include <vector>

namespace Store
{

/// Where a subject's record keeps an entry.
enum class EStorage : std::uint8_t
{
  Group, ///< nowhere: the entry only groups others and never has a value
  Name,  ///< the record's name
  Bit,   ///< a bit of the record's truth values
  Value  ///< one of the record's values
};

/// Who writes an entry.
enum class EWriter : std::uint8_t
{
  Anyone,
  StoreOnly
};

/// One entry that subjects of a kind have.
struct SchemaEntry
{
  NMX::EntryPath path;
  NMX::EValueType type;
  NMX::EAspect aspect; ///< the change stamp that a write advances
  EStorage storage;
  EWriter writer;
  std::uint8_t index; ///< which bit, or which value
  NMX::Value initial;
};

/// Indexes of the values that every kind has, in every record.
namespace CommonValue
{
inline constexpr std::size_t subjectId = 0;
inline constexpr std::size_t flags = 1;
inline constexpr std::size_t parent = 2;
inline constexpr std::size_t parentSlot = 3;
inline constexpr std::size_t children = 4;
}

/// The entries that subjects of one kind have. Built once, constant afterwards. [any]
class KindSchema
{
public:
  [[nodiscard]] static const KindSchema& Of(NMX::ESubjectKind kind);

  /// Null when the kind has no such entry.
  [[nodiscard]] const SchemaEntry* Find(NMX::EntryPath path) const
  {
    const std::uint32_t number = path.Number();
    return number < m_byPath.size() && m_byPath[number] != 0 ? &m_entries[m_byPath[number] - 1U] : nullptr;
  }

  [[nodiscard]] std::span<const SchemaEntry> Entries() const { return m_entries; }
  [[nodiscard]] std::size_t ValueCount() const { return m_valueCount; }
  [[nodiscard]] std::uint64_t InitialBits() const { return m_initialBits; }

  /// The bits that are warnings, the same for every kind.
  [[nodiscard]] static std::uint64_t WarningBits();
  /// The bit of a truth value of characters.
  [[nodiscard]] static std::uint64_t CharacterBit(NMX::EntryPath path);

private:
  explicit KindSchema(NMX::ESubjectKind kind);

  std::vector<SchemaEntry> m_entries;
  std::vector<std::uint8_t> m_byPath; // path number to position in m_entries plus one
  std::size_t m_valueCount = 0;
  std::uint64_t m_initialBits = 0;
};

}
