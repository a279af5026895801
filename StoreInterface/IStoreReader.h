#pragma once

#include "HostInterface/NMX/IResult.h"
#include "HostInterface/NMX/ITypedId.h"
#include "StoreInterface/EntryPath.h"
#include "StoreInterface/SubjectKind.h"
#include "StoreInterface/Value.h"

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace NMX
{

/// The aspects of a subject whose changes are counted apart.
enum class EAspect : std::uint8_t
{
  Parameters, ///< also roles, parent, children and slots
  Markers,
  ModelOutputs,
  Warnings,
  SmartClusters ///< also the devices linked to them
};

/// For each aspect the number of its latest change. Numbers come from one counter of the whole store, so that a
/// greater one is always the later one; they start afresh with the program.
using ChangeStamps = std::array<std::uint64_t, 5>;

/// A consistent view of the store for as long as it lives. Destroying it releases the access.
/// Operations on an id that is not in the store answer `InvalidId`.
class IStoreReader
{
public:
  IStoreReader() = default;
  IStoreReader(const IStoreReader&) = delete;
  IStoreReader& operator=(const IStoreReader&) = delete;
  virtual ~IStoreReader() = default;

  /// The subject of that name, of any kind; names are the same when their NFC is. `NotFound` when there is none.
  virtual IResult FindByName(std::string_view name, TSubjectStoreId& id) const = 0;

  /// Whether the subject is an object: SubjectFlag::rigid, SubjectFlag::smart, both or neither.
  virtual IResult ObjectKind(TSubjectStoreId id, std::uint32_t& kind) const = 0;

  virtual IResult Kind(TSubjectStoreId id, ESubjectKind& kind) const = 0;

  /// All subjects of a kind in ascending order of id.
  virtual IResult Subjects(ESubjectKind kind, std::vector<TSubjectStoreId>& ids) const = 0;

  /// The subject's direct children in ascending order of id.
  virtual IResult Children(TSubjectStoreId id, std::vector<TSubjectStoreId>& ids) const = 0;

  /// The subject itself and everything beneath it, in ascending order of id.
  virtual IResult Descendants(TSubjectStoreId id, std::vector<TSubjectStoreId>& ids) const = 0;

  virtual IResult Stamps(TSubjectStoreId id, ChangeStamps& stamps) const = 0;

  /// The value of a subject's entry, or null when its kind has no such entry. The value is valid until the access is
  /// released or, in an edit access, until the next edit. Use Read (TypedAccess.h) rather than this.
  virtual IResult Find(TSubjectStoreId id, EntryPath path, const Value*& value) const = 0;

  /// The value of an application entry, such as a setting, or null when there is no such entry.
  [[nodiscard]] virtual const Value* FindApplicationEntry(EntryPath path) const = 0;

  /// The paths of all application entries beneath `path`, in the order of their texts.
  [[nodiscard]] virtual std::vector<EntryPath> ApplicationEntries(EntryPath path) const = 0;

  /// Regular expression (ECMAScript) that a subject's name must match in full: that of the setting NameRegex, or the
  /// store's own.
  [[nodiscard]] virtual std::string NamePattern() const = 0;
};

}
