#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"

#include "StoreInterface/EntryPaths.h"

#include <exception>

namespace Subjects
{

using NMX::EResult;
using NMX::IResult;

namespace
{

IResult CheckObjectKind(const NMX::IStoreReader& access, NMX::TSubjectStoreId id, bool (*accepts)(std::uint32_t))
{
  std::uint32_t objectKind = 0;
  if (const IResult asked = access.ObjectKind(id, objectKind); asked.Failed())
    return asked;
  return accepts(objectKind) ? EResult::Ok : EResult::InvalidArgument;
}

}

IResult MustBeBasicObject(const NMX::IStoreReader& access, NMX::TSubjectStoreId id)
{
  return CheckObjectKind(access, id, [](std::uint32_t objectKind)
                         { return (objectKind & NMX::SubjectFlag::objectKindMask) == NMX::SubjectFlag::rigid; });
}

IResult MustBeSmartObject(const NMX::IStoreReader& access, NMX::TSubjectStoreId id)
{
  return CheckObjectKind(access, id,
                         [](std::uint32_t objectKind) { return (objectKind & NMX::SubjectFlag::smart) != 0; });
}

IResult MustBeObject(const NMX::IStoreReader& access, NMX::TSubjectStoreId id)
{
  return CheckObjectKind(access, id,
                         [](std::uint32_t objectKind) { return (objectKind & NMX::SubjectFlag::objectKindMask) != 0; });
}

IResult MustBeCharacter(const NMX::IStoreReader& access, NMX::TSubjectStoreId id)
{
  NMX::ESubjectKind kind{};
  if (const IResult asked = access.Kind(id, kind); asked.Failed())
    return asked;
  return kind == NMX::ESubjectKind::CharactersFromClusters ? EResult::Ok : EResult::NotSupported;
}

IResult FindSubject(const NMX::IStoreReader& access, std::string_view name, SubjectRule rule, NMX::TSubjectStoreId& id)
{
  NMX::TSubjectStoreId found;
  if (const IResult sought = access.FindByName(name, found); sought.Failed())
    return sought;
  if (const IResult accepted = rule(access, found); accepted.Failed())
    return accepted;
  id = found;
  return EResult::Ok;
}

IResult ReportException() noexcept
{
  try
  {
    throw;
  }
  catch (const std::exception& failure)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "A subject operation failed: %1%", failure.what());
  }
  catch (...)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "A subject operation failed with an unknown exception.");
  }
  return EResult::FailedWithException;
}

IResult ListNames(const NMX::IStore& store, NMX::ESubjectKind kind, NMX::LogFormat complaint,
                  std::set<std::string>& names) noexcept
{
  return Guarded(
      [&]() -> IResult
      {
        const auto reader = store.Reader();
        std::vector<NMX::TSubjectStoreId> ids;
        if (const IResult listed = reader->Subjects(kind, ids); listed.Failed())
          return listed;
        std::set<std::string> read;
        for (const NMX::TSubjectStoreId id : ids)
        {
          std::string name;
          if (NMX::Read(*reader, id, NMX::Paths::Name(), name).Failed())
            NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, complaint, id);
          else
            read.insert(std::move(name));
        }
        names = std::move(read);
        return EResult::Ok;
      });
}

}
