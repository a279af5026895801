#include "RunaCorePluginSubjectStore/ObjectEvaluationServices/VObjectEvaluationServices.h"

#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"

#include <functional>
#include <utility>

namespace ObjectEvaluationServices
{

using NMX::EResult;
using NMX::IResult;

namespace
{

/// Asks the engine, if there is one: `operation` with `arguments`.
template <class Operation, class Engine, class... Arguments>
IResult Ask(Engine& engine, Operation operation, Arguments&... arguments) noexcept
{
  return Subjects::Guarded([&]() -> IResult
                           { return engine ? std::invoke(operation, *engine, arguments...) : EResult::NotSupported; });
}

IResult FindObject(const NMX::IStoreReader& reader, const std::string& name, NMX::TSubjectStoreId& id)
{
  const IResult found = Subjects::FindSubject(reader, name, Subjects::MustBeObject, id);
  return found == EResult::NotFound ? EResult::InvalidArgument : found;
}

}

VObjectEvaluationServices::VObjectEvaluationServices(std::shared_ptr<NMX::IStore> store, std::shared_ptr<Engine> engine)
    : m_store(std::move(store)), m_engine(std::move(engine)),
      m_changed(NMX::MakeShared<NotificationSystem::VMultiCallbackPostal<void()>>())
{
}

std::shared_ptr<VObjectEvaluationServices> VObjectEvaluationServices::Make(std::shared_ptr<NMX::IStore> store,
                                                                           std::shared_ptr<Engine> engine)
{
  auto service = NMX::MakeShared<VObjectEvaluationServices>(std::move(store), std::move(engine));
  if (service->m_engine)
    service->m_engineChanges = service->m_engine->OnChange(
        [weak = std::weak_ptr(service)]
        {
          if (const auto alive = weak.lock())
            alive->m_changed->Fire();
        });
  return service;
}

IResult VObjectEvaluationServices::Enabled(bool& enabled) const
{
  return Ask(m_engine, &Engine::Enabled, enabled);
}

IResult VObjectEvaluationServices::SetEnabled(bool enabled)
{
  return Ask(m_engine, &Engine::SetEnabled, enabled);
}

IResult VObjectEvaluationServices::MaximumEvaluationStepCount(std::uint64_t& maximumStepCount) const
{
  return Ask(m_engine, &Engine::MaximumEvaluationStepCount, maximumStepCount);
}

IResult VObjectEvaluationServices::SetMaximumEvaluationStepCount(std::uint64_t maximumStepCount)
{
  return Ask(m_engine, &Engine::SetMaximumEvaluationStepCount, maximumStepCount);
}

IResult VObjectEvaluationServices::WarningThreshold(double& threshold) const
{
  return Ask(m_engine, &Engine::WarningThreshold, threshold);
}

IResult VObjectEvaluationServices::SetWarningThreshold(double threshold)
{
  return Ask(m_engine, &Engine::SetWarningThreshold, threshold);
}

IResult VObjectEvaluationServices::Progress(std::uint64_t& done, std::uint64_t& required) const
{
  return Ask(m_engine, &Engine::Progress, done, required);
}

IResult VObjectEvaluationServices::HighestStepCountReached(std::uint64_t& highestStepCountReached) const
{
  return Ask(m_engine, &Engine::HighestStepCountReached, highestStepCountReached);
}

IResult VObjectEvaluationServices::MatchDistance(const std::string& firstObjectName,
                                                 const std::string& secondObjectName, bool& matches,
                                                 double& matchDistance) const
{
  return Subjects::Guarded(
      [&]() -> IResult
      {
        if (!m_engine)
          return EResult::NotSupported;
        const auto reader = m_store->Reader();
        NMX::TSubjectStoreId first;
        NMX::TSubjectStoreId second;
        if (const IResult found = FindObject(*reader, firstObjectName, first); found.Failed())
          return found;
        if (const IResult found = FindObject(*reader, secondObjectName, second); found.Failed())
          return found;
        return m_engine->MatchDistance(*reader, first, second, matches, matchDistance);
      });
}

std::shared_ptr<NMX::IObjectEvaluationServices::ChangedCallback> VObjectEvaluationServices::EvaluationChangedCallback()
{
  return m_changed;
}

}
