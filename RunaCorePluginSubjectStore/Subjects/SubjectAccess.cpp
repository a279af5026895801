#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"

#include "StoreInterface/EntryPaths.h"

#include <exception>

namespace Subjects
{

using NMX::EResult;
using NMX::IResult;

IResult FindSubject(const NMX::IStoreReader& access, std::string_view name, KindRule rule, NMX::TSubjectStoreId& id)
{
  if (const IResult found = access.FindByName(name, id); found.Failed())
    return found;
  std::uint32_t objectKind = 0;
  if (const IResult asked = access.ObjectKind(id, objectKind); asked.Failed())
    return asked;
  return rule(objectKind) ? EResult::Ok : EResult::InvalidArgument;
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
