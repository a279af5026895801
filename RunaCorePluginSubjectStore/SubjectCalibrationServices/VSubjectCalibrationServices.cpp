#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/VSubjectCalibrationServices.h"

#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/Settings.h"
#include "RunaCorePluginSubjectStore/Subjects/NameCheck.h"
#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"
#include "StoreInterface/TryToAdd.h"

#include <set>
#include <utility>

namespace SubjectCalibrationServices
{

using NMX::EResult;
using NMX::ESetting;
using NMX::IResult;
using NMX::TCalibrationSessionId;
using NMX::TSubjectStoreId;
using Subjects::Guarded;

namespace
{

template <class Signature>
auto MakeCallback()
{
  return NMX::MakeShared<NotificationSystem::VMultiCallbackPostal<Signature>>();
}

/// Files are named after captures.
bool IsCaptureName(const std::string& name)
{
  return name.find_first_of(R"(/:*?"<>|.,;\)") == std::string::npos;
}

/// What the settings say of a new subject.
struct NewSubject
{
  std::string name;
  std::wstring labellingTemplate;
  std::wstring skin;
};

NewSubject ReadNewSubject(const NMX::IStoreReader& reader)
{
  const auto* name = FindSetting<std::string>(reader, ESetting::CreateSubjectName);
  return {name != nullptr ? *name : std::string{}, ChosenPath(reader, ESetting::CreateSubjectTemplate),
          ChosenPath(reader, ESetting::CreateSubjectSkin)};
}

/// Runs a query; an exception that escapes it is logged, and the answer is no.
template <class Query>
bool GuardedQuery(Query query, std::string& reason) noexcept
{
  bool answer = false;
  const IResult asked = Guarded(
      [&]() -> IResult
      {
        std::string why;
        answer = query(why);
        reason = std::move(why);
        return EResult::Ok;
      });
  return asked.Succeeded() && answer;
}

}

std::shared_ptr<VSubjectCalibrationServices>
VSubjectCalibrationServices::Make(std::shared_ptr<NMX::IStore> store,
                                  std::shared_ptr<ISubjectCalibrationController> controller,
                                  std::shared_ptr<ISubjectCreator> creator, ICalibrationNotifications& notifications,
                                  const std::weak_ptr<NMX::IPostalService>& strand)
{
  auto service =
      NMX::MakeShared<VSubjectCalibrationServices>(std::move(store), std::move(controller), std::move(creator));
  const auto handler = [weak = std::weak_ptr(service)](void (VSubjectCalibrationServices::*handle)())
  {
    return [weak, handle]
    {
      if (const auto alive = weak.lock())
        (void)Guarded(
            [&]() -> IResult
            {
              ((*alive).*handle)();
              return EResult::Ok;
            });
    };
  };
  service->m_subscriptions = {
      notifications.StateChanged()->Subscribe(strand, handler(&VSubjectCalibrationServices::TellState)),
      notifications.PossibilitiesChanged()->Subscribe(strand,
                                                      handler(&VSubjectCalibrationServices::RefreshPossibilities)),
      service->m_store->OnChange(std::string(NMX::PathOf(ESetting::Root).Text()) + "/*", strand,
                                 [changed = service->m_settingsChanged] { changed->Fire(); })};
  return service;
}

VSubjectCalibrationServices::VSubjectCalibrationServices(std::shared_ptr<NMX::IStore> store,
                                                         std::shared_ptr<ISubjectCalibrationController> controller,
                                                         std::shared_ptr<ISubjectCreator> creator)
    : m_store(std::move(store)), m_controller(std::move(controller)), m_creator(std::move(creator)),
      m_stateChanged(MakeCallback<void(TCalibrationSessionId, ESubjectCalibrationState)>()),
      m_settingsChanged(MakeCallback<void()>()),
      m_canChanged{MakeCallback<void(bool)>(), MakeCallback<void(bool)>(), MakeCallback<void(bool)>(),
                   MakeCallback<void(bool)>(), MakeCallback<void(bool)>()}
{
}

bool VSubjectCalibrationServices::CanStartSubjectCalibration(std::string& reason) const
{
  return GuardedQuery(
      [&](std::string& why)
      {
        const auto reader = m_store->Reader();
        const auto* action = FindSetting<NMX::Action>(*reader, ESetting::CreateSubjectAction);
        const bool impossible = action != nullptr && (action->state & NMX::Action::impossible) != 0;
        if (impossible)
          why = action->text;
        return !impossible;
      },
      reason);
}

bool VSubjectCalibrationServices::CanStartSubjectRecalibration(std::string& reason) const
{
  return GuardedQuery([&](std::string& why)
                      { return m_controller->CanPerform(ECalibrationAction::StartRecalibration, why); }, reason);
}

bool VSubjectCalibrationServices::CanAcceptTPose(std::string& reason) const
{
  return GuardedQuery([&](std::string& why) { return m_controller->CanPerform(ECalibrationAction::AcceptTPose, why); },
                      reason);
}

bool VSubjectCalibrationServices::CanStopSubjectCalibration(std::string& reason) const
{
  return GuardedQuery([&](std::string& why) { return m_controller->CanPerform(ECalibrationAction::Stop, why); },
                      reason);
}

bool VSubjectCalibrationServices::CanCancelSubjectCalibration(std::string& reason) const
{
  return GuardedQuery([&](std::string& why) { return m_controller->CanPerform(ECalibrationAction::Cancel, why); },
                      reason);
}

std::shared_ptr<NMX::ISubjectCalibrationServices::CanChangedCallback>
VSubjectCalibrationServices::CanStartSubjectCalibrationChangedCallback()
{
  return m_canChanged[StartCalibration];
}

std::shared_ptr<NMX::ISubjectCalibrationServices::CanChangedCallback>
VSubjectCalibrationServices::CanStartSubjectRecalibrationChangedCallback()
{
  return m_canChanged[StartRecalibration];
}

std::shared_ptr<NMX::ISubjectCalibrationServices::CanChangedCallback>
VSubjectCalibrationServices::CanAcceptTPoseChangedCallback()
{
  return m_canChanged[AcceptPose];
}

std::shared_ptr<NMX::ISubjectCalibrationServices::CanChangedCallback>
VSubjectCalibrationServices::CanStopSubjectCalibrationChangedCallback()
{
  return m_canChanged[Stop];
}

std::shared_ptr<NMX::ISubjectCalibrationServices::CanChangedCallback>
VSubjectCalibrationServices::CanCancelSubjectCalibrationChangedCallback()
{
  return m_canChanged[Cancel];
}

/// Adds the new subject to the store. No edit is open while its files are read, which comes after its name is known to
/// be possible.
IResult VSubjectCalibrationServices::CreateSubject(TSubjectStoreId& subject)
{
  const auto [name, labellingTemplate, skin] = ReadNewSubject(*m_store->Reader());
  if (const IResult possible = NMX::TryToAdd(*m_store, NMX::ESubjectKind::GeneralSubjects, name); possible.Failed())
    return possible;
  std::shared_ptr<const ISubjectTemplate> content;
  if (const IResult read = m_creator->ReadTemplate(labellingTemplate, skin, content); read.Failed())
    return read;
  const auto editor = m_store->Editor();
  if (const IResult created = m_creator->CreateSubject(*editor, name, *content); created.Failed())
    return created;
  if (const IResult found = editor->FindByName(name, subject); found.Failed())
    return found;
  return editor->Commit();
}

/// Tells the controller which subject the next run works on. No store access is held meanwhile.
IResult VSubjectCalibrationServices::SetTarget(TSubjectStoreId subject)
{
  if (const IResult set = m_controller->SetTargetSubject(subject); set.Failed())
    return set;
  std::vector<TSubjectStoreId> beneath;
  if (const IResult collected = m_store->Reader()->Descendants(subject, beneath); collected.Failed())
    return collected;
  return m_controller->SetTargetSubjects({beneath.begin(), beneath.end()});
}

IResult VSubjectCalibrationServices::Start(ECalibrationAction action, TCalibrationSessionId& session)
{
  TCalibrationSessionId started;
  const IResult performed = m_controller->Perform(action, started);
  if (performed.Succeeded())
    m_session = session = started;
  return performed;
}

IResult VSubjectCalibrationServices::StartSubjectCalibration(TCalibrationSessionId& subjectCalibrationSession,
                                                             const std::string& captureName)
{
  return Guarded(
      [&]() -> IResult
      {
        if (!IsCaptureName(captureName))
          return EResult::InvalidArgument;
        TSubjectStoreId subject;
        if (const IResult created = CreateSubject(subject); created.Failed())
          return created;
        if (const IResult set = SetTarget(subject); set.Failed())
          return set;
        std::string reason;
        if (!m_controller->CanPerform(ECalibrationAction::StartCalibration, reason))
          return EResult::NotAvailable;
        m_controller->SetFreshCalibration(true);
        return Start(ECalibrationAction::StartCalibration, subjectCalibrationSession);
      });
}

IResult VSubjectCalibrationServices::StartSubjectRecalibration(TCalibrationSessionId& subjectCalibrationSession,
                                                               const std::string& captureName)
{
  return Guarded(
      [&]() -> IResult
      {
        std::string reason;
        if (!m_controller->CanPerform(ECalibrationAction::StartRecalibration, reason))
          return EResult::NotAvailable;
        if (!IsCaptureName(captureName))
          return EResult::InvalidArgument;
        return Start(ECalibrationAction::StartRecalibration, subjectCalibrationSession);
      });
}

IResult VSubjectCalibrationServices::PerformIfPossible(ECalibrationAction action, TCalibrationSessionId session)
{
  return Guarded(
      [&]() -> IResult
      {
        std::string reason;
        return m_controller->CanPerform(action, reason) ? m_controller->Perform(action, session)
                                                        : IResult(EResult::NotAvailable);
      });
}

IResult VSubjectCalibrationServices::AcceptTPose(TCalibrationSessionId subjectCalibrationSession)
{
  return PerformIfPossible(ECalibrationAction::AcceptTPose, subjectCalibrationSession);
}

IResult VSubjectCalibrationServices::CancelSubjectCalibration(TCalibrationSessionId subjectCalibrationSession)
{
  return PerformIfPossible(ECalibrationAction::Cancel, subjectCalibrationSession);
}

IResult VSubjectCalibrationServices::StopSubjectCalibration(TCalibrationSessionId subjectCalibrationSession)
{
  return PerformIfPossible(ECalibrationAction::Stop, subjectCalibrationSession);
}

NMX::ISubjectCalibrationServices::ESubjectCalibrationState VSubjectCalibrationServices::State() const
{
  switch (m_controller->Phase())
  {
  case 1:
    return ESubjectCalibrationState::TPoseLabelling;
  case 2:
  case 3:
    return ESubjectCalibrationState::Calibrating;
  default:
    break;
  }
  const IResult ended = m_controller->LastResult();
  return ended == EResult::NotSet     ? ESubjectCalibrationState::None
         : ended == EResult::Canceled ? ESubjectCalibrationState::Cancelled
                                      : ESubjectCalibrationState::Completed;
}

IResult VSubjectCalibrationServices::LatestSubjectCalibrationState(TCalibrationSessionId& sessionId,
                                                                   ESubjectCalibrationState& state) const
{
  return Guarded(
      [&]() -> IResult
      {
        state = State();
        sessionId = m_session;
        return EResult::Ok;
      });
}

std::shared_ptr<NMX::ISubjectCalibrationServices::StateChangedCallback>
VSubjectCalibrationServices::LatestSubjectCalibrationStateChangedCallback()
{
  return m_stateChanged;
}

void VSubjectCalibrationServices::TellState()
{
  m_stateChanged->Fire(m_session, State());
}

void VSubjectCalibrationServices::RefreshPossibilities()
{
  std::string reason;
  const std::array<bool, CanCount> now{CanStartSubjectCalibration(reason), CanStartSubjectRecalibration(reason),
                                       CanAcceptTPose(reason), CanStopSubjectCalibration(reason),
                                       CanCancelSubjectCalibration(reason)};
  const std::array<bool, CanCount> before = std::exchange(m_can, now);
  for (std::size_t can = 0; can < now.size(); ++can)
    if (now[can] != before[can])
      m_canChanged[can]->Fire(now[can]);
}

IResult VSubjectCalibrationServices::SetNewSubjectName(const std::string& subjectName)
{
  return Guarded(
      [&]() -> IResult
      {
        TSubjectStoreId named;
        {
          const auto reader = m_store->Reader();
          if (!Subjects::MatchesPattern(subjectName, reader->NamePattern()))
            return EResult::InvalidArgument;
          (void)reader->FindByName(subjectName, named);
        }
        if (named.Valid())
          if (const IResult set = SetTarget(named); set.Failed())
            return set;
        const auto editor = m_store->Editor();
        if (const IResult set = editor->SetApplicationEntry(NMX::PathOf(ESetting::CreateSubjectName), subjectName);
            set.Failed())
          return set;
        return editor->Commit();
      });
}

IResult VSubjectCalibrationServices::NewSubjectName(std::string& subjectName) const
{
  return Guarded(
      [&]() -> IResult
      {
        const auto reader = m_store->Reader();
        const auto* name = FindSetting<std::string>(*reader, ESetting::CreateSubjectName);
        if (name == nullptr)
          return EResult::Failed;
        subjectName = *name;
        return EResult::Ok;
      });
}

IResult VSubjectCalibrationServices::SubjectLabellingTemplates(std::vector<std::string>& labellingTemplates) const
{
  return OptionNames(*m_store, ESetting::CreateSubjectTemplate, labellingTemplates);
}

IResult VSubjectCalibrationServices::SetSubjectLabellingTemplate(const std::string& labellingTemplate)
{
  return Choose(*m_store, ESetting::CreateSubjectTemplate, labellingTemplate);
}

IResult VSubjectCalibrationServices::SubjectLabellingTemplate(std::string& labellingTemplate,
                                                              std::string& labellingTemplatePath) const
{
  return Chosen(*m_store, ESetting::CreateSubjectTemplate, labellingTemplate, labellingTemplatePath);
}

IResult VSubjectCalibrationServices::SubjectSkins(std::vector<std::string>& skins) const
{
  return OptionNames(*m_store, ESetting::CreateSubjectSkin, skins);
}

IResult VSubjectCalibrationServices::SetSubjectSkin(const std::string& skin)
{
  return Choose(*m_store, ESetting::CreateSubjectSkin, skin);
}

IResult VSubjectCalibrationServices::SubjectSkin(std::string& skin, std::string& skinPath) const
{
  return Chosen(*m_store, ESetting::CreateSubjectSkin, skin, skinPath);
}

std::shared_ptr<NMX::ISubjectCalibrationServices::SettingsChangedCallback>
VSubjectCalibrationServices::SubjectCalibrationSettingsChangedCallback()
{
  return m_settingsChanged;
}

}
