#pragma once

#include "HostInterface/NMX/IResult.h"
#include "StoreInterface/IStore.h"
#include "StoreInterface/TypedAccess.h"

#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

/// The two shapes that nearly every operation of the object services has: one subject found by its name, or all
/// subjects of a kind. Store access is taken for the one operation and released whatever happens; an exception comes
/// back as `FailedWithException`.
namespace Subjects
{

/// Which subjects a service accepts: `Ok`, or why it does not accept this one.
using SubjectRule = NMX::IResult (*)(const NMX::IStoreReader& access, NMX::TSubjectStoreId id);

/// `InvalidArgument` unless the store's object-kind answer is that of a basic object, of a smart one, of either.
NMX::IResult MustBeBasicObject(const NMX::IStoreReader& access, NMX::TSubjectStoreId id);
NMX::IResult MustBeSmartObject(const NMX::IStoreReader& access, NMX::TSubjectStoreId id);
NMX::IResult MustBeObject(const NMX::IStoreReader& access, NMX::TSubjectStoreId id);

/// `NotSupported` unless it is a character from clusters.
NMX::IResult MustBeCharacter(const NMX::IStoreReader& access, NMX::TSubjectStoreId id);

/// Finds a subject by name and asks the rule: the store's failure, or the rule's.
NMX::IResult FindSubject(const NMX::IStoreReader& access, std::string_view name, SubjectRule rule,
                         NMX::TSubjectStoreId& id);

/// Logs the exception that is being handled.
NMX::IResult ReportException() noexcept;

/// Runs an operation; an exception that escapes it is logged and becomes `FailedWithException`.
template <class Operation>
NMX::IResult Guarded(Operation operation) noexcept
{
  try
  {
    return operation();
  }
  catch (...)
  {
    return ReportException();
  }
}

/// Reads from the subject of that name: `step(reader, id)`.
template <class Step>
NMX::IResult ReadSubject(const NMX::IStore& store, std::string_view name, SubjectRule rule, Step step) noexcept
{
  return Guarded(
      [&]() -> NMX::IResult
      {
        const auto reader = store.Reader();
        NMX::TSubjectStoreId id;
        if (const NMX::IResult found = FindSubject(*reader, name, rule, id); found.Failed())
          return found;
        return step(*reader, id);
      });
}

/// Edits the subject of that name: `step(editor, id)`, committed when it succeeds.
template <class Step>
NMX::IResult EditSubject(NMX::IStore& store, std::string_view name, SubjectRule rule, Step step) noexcept
{
  return Guarded(
      [&]() -> NMX::IResult
      {
        const auto editor = store.Editor();
        NMX::TSubjectStoreId id;
        if (const NMX::IResult found = FindSubject(*editor, name, rule, id); found.Failed())
          return found;
        if (const NMX::IResult edited = step(*editor, id); edited.Failed())
          return edited;
        return editor->Commit();
      });
}

/// A getter: one entry of the subject of that name.
template <class T>
NMX::IResult ReadEntry(const NMX::IStore& store, std::string_view name, SubjectRule rule, NMX::EntryPath path,
                       T& value) noexcept
{
  return ReadSubject(store, name, rule, [&](const NMX::IStoreReader& reader, NMX::TSubjectStoreId id)
                     { return NMX::Read(reader, id, path, value); });
}

/// A setter: one entry of the subject of that name.
inline NMX::IResult WriteEntry(NMX::IStore& store, std::string_view name, SubjectRule rule, NMX::EntryPath path,
                               NMX::Value value, NMX::ENotify notify = NMX::ENotify::No) noexcept
{
  return EditSubject(store, name, rule, [&](NMX::IEntryEditor& editor, NMX::TSubjectStoreId id)
                     { return editor.SetValue(id, path, std::move(value), notify); });
}

/// What a list-wide edit does when one subject refuses.
enum class EOnFailure
{
  GoOn, ///< the others are edited all the same and the refusal is dropped
  Stop  ///< nothing is changed and the refusal is the result
};

/// Edits every subject of a kind in ascending order of id: `step(editor, id)`. All is committed as one edit.
template <class Step>
NMX::IResult EditAll(NMX::IStore& store, NMX::ESubjectKind kind, EOnFailure onFailure, Step step) noexcept
{
  return Guarded(
      [&]() -> NMX::IResult
      {
        const auto editor = store.Editor();
        std::vector<NMX::TSubjectStoreId> ids;
        if (const NMX::IResult listed = editor->Subjects(kind, ids); listed.Failed())
          return listed;
        for (const NMX::TSubjectStoreId id : ids)
          if (const NMX::IResult edited = step(*editor, id); edited.Failed() && onFailure == EOnFailure::Stop)
            return edited;
        return editor->Commit();
      });
}

/// The names of all subjects of a kind. A name that cannot be read is left out, and `complaint` (with "%1%" for the
/// subject's id) is logged.
NMX::IResult ListNames(const NMX::IStore& store, NMX::ESubjectKind kind, NMX::LogFormat complaint,
                       std::set<std::string>& names) noexcept;

}
