#pragma once

#include "StoreInterface/IStoreReader.h"

namespace NMX
{

/// Whether what depends on a value (group warnings, slots that show the name) is derived again in the same commit.
enum class ENotify : bool
{
  No,
  Yes
};

/// Edit access: a transaction that reads its own edits. Nothing is seen by others, or kept, before Commit; released
/// without it, everything is discarded. A failed operation changes nothing.
class IEntryEditor : public IStoreReader
{
public:
  /// Adds a subject with the default value of each entry of its kind. `InvalidName` when the name does not match the
  /// name pattern, `AlreadyPresent` when a subject of any kind has it, in whatever form of Unicode.
  virtual IResult Add(ESubjectKind kind, std::string_view name, TSubjectStoreId& id) = 0;

  /// Removes a subject. Its children stay, without a parent; what it filled becomes empty.
  virtual IResult Remove(TSubjectStoreId id) = 0;

  /// Gives a subject another name; refusals as in Add. A subject may be given the name that it has.
  virtual IResult Rename(TSubjectStoreId id, std::string_view name, ENotify notify) = 0;

  /// Writes an entry; "no value" empties it. `NotFound` when the subject's kind has no such entry, `InvalidType` when
  /// the value is of another type, `NotPermitted` for an entry that only the store writes, `InvalidValue` for a
  /// parent that would make the subject its own ancestor, and for texts and lists that are too large (ValueLimits.h).
  virtual IResult SetValue(TSubjectStoreId id, EntryPath path, Value value, ENotify notify = ENotify::No) = 0;

  /// Writes or adds an application entry; "no value" removes it. `InvalidValue` for texts, lists and paths that are too
  /// large (ValueLimits.h), `AllocationFailure` when there are too many entries to add one.
  virtual IResult SetApplicationEntry(EntryPath path, Value value) = 0;

  /// Makes the edits lasting and visible, all or none, and then tells whoever subscribed. `FileIOFailure` or `DiskFull`
  /// when they cannot be kept: nothing has changed then. The editor cannot be used afterwards (`NotAvailable`).
  virtual IResult Commit() = 0;
};

}
