#include "StandaloneHost/Calibration/VSubjectCalibrationController.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Store/CreateActions.h"
#include "StoreInterface/CalibrationState.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/SettingsPaths.h"
#include "StoreInterface/TypedAccess.h"

#include <boost/asio/io_context.hpp>

#include <exception>
#include <utility>
#include <vector>

namespace Calibration
{

using NMX::EResult;
using NMX::IResult;
using NMX::TCalibrationSessionId;
using NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

constexpr const char* runs = "A subject calibration is running.";
constexpr const char* nothingRuns = "No subject calibration is running.";

/// How long until an end that could not be kept is tried again.
constexpr std::chrono::seconds retryTime{1};

/// Writes what the store shows of a calibration that begins or ends.
IResult Show(NMX::IEntryEditor& editor, TSubjectStoreId subject, std::int32_t state)
{
  if (const IResult set = editor.SetValue(subject, Paths::Calibration(), state);
      set.Failed() && set != EResult::InvalidId) // it may have been removed meanwhile
    return set;
  const NMX::Value running = state == NMX::CalibrationState::running ? NMX::Value(true) : NMX::Value{};
  return editor.SetApplicationEntry(Store::CalibrationRunning(), running);
}

}

VSubjectCalibrationController::VSubjectCalibrationController(std::shared_ptr<NMX::IStore> store,
                                                             std::shared_ptr<NMX::IAsioPostalService> postal,
                                                             std::shared_ptr<VCalibrationNotifications> notifications,
                                                             CalibrationTimes times)
    : m_store(std::move(store)), m_postal(std::move(postal)), m_notifications(std::move(notifications)), m_times(times)
{
}

void VSubjectCalibrationController::Open(const std::weak_ptr<NMX::IPostalService>& postal)
{
  const auto tell = [notifications = m_notifications] { notifications->TellPossibilities(); };
  m_subscriptions = {
      m_store->OnChange(std::string(NMX::PathOf(NMX::ESetting::CreateSubjectAction).Text()), postal, tell),
      m_store->SubjectsChanged(NMX::ESubjectKind::GeneralSubjects)->Subscribe(postal, tell)};
  const auto editor = m_store->Editor();
  std::vector<TSubjectStoreId> subjects;
  if (editor->Subjects(NMX::ESubjectKind::GeneralSubjects, subjects).Failed())
    return;
  for (const TSubjectStoreId subject : subjects)
  {
    std::int32_t state = 0;
    if (NMX::Read(*editor, subject, Paths::Calibration(), state).Succeeded() && state == NMX::CalibrationState::running)
      (void)editor->SetValue(subject, Paths::Calibration(), NMX::CalibrationState::none);
  }
  (void)editor->SetApplicationEntry(Store::CalibrationRunning(), {});
  TSubjectStoreId target;
  const NMX::Value* name = editor->FindApplicationEntry(NMX::PathOf(NMX::ESetting::CreateSubjectName));
  if (const auto* text = name != nullptr ? std::get_if<std::string>(name) : nullptr)
    (void)editor->FindByName(*text, target);
  if (const IResult kept = editor->Commit(); kept.Failed())
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error,
             "The calibration that an earlier program left running cannot be ended: %1%", kept.Name());
  {
    const std::lock_guard lock(m_stateMutex);
    m_state.target = target;
  }
  tell();
}

void VSubjectCalibrationController::Stop()
{
  const std::lock_guard lock(m_stateMutex);
  m_stopped = true;
  m_timer.reset();
}

VSubjectCalibrationController::State VSubjectCalibrationController::Current() const
{
  const std::lock_guard lock(m_stateMutex);
  return m_state;
}

IResult VSubjectCalibrationController::SetTargetSubject(TSubjectStoreId subject)
{
  NMX::ESubjectKind kind{};
  if (const IResult found = m_store->Reader()->Kind(subject, kind); found.Failed())
    return found;
  {
    const std::lock_guard lock(m_stateMutex);
    m_state.target = subject;
  }
  m_notifications->TellPossibilities();
  return EResult::Ok;
}

IResult VSubjectCalibrationController::SetTargetSubjects(const std::set<TSubjectStoreId>& subjects)
{
  // What is beneath the subject is calibrated with it: nothing is to be done for it here.
  return subjects.contains(Current().target) ? EResult::Ok : EResult::InvalidArgument;
}

void VSubjectCalibrationController::SetFreshCalibration(bool /*fresh*/)
{
  // Fresh or not, the calibration that is played is the same.
}

std::string VSubjectCalibrationController::ObstacleToStart(ECalibrationAction action, TSubjectStoreId target) const
{
  if (!target.Valid())
    return action == ECalibrationAction::StartCalibration ? "There is no subject to calibrate."
                                                          : "No subject to recalibrate has been named.";
  const auto reader = m_store->Reader();
  NMX::ESubjectKind kind{};
  std::string name;
  if (reader->Kind(target, kind).Failed() || NMX::Read(*reader, target, Paths::Name(), name).Failed())
    return "The subject to calibrate does not exist any more.";
  return kind == NMX::ESubjectKind::GeneralSubjects ? std::string{}
                                                    : "\"" + name + "\" is not a subject that can be calibrated.";
}

/// Why an action is not possible; empty when it is.
std::string VSubjectCalibrationController::Obstacle(ECalibrationAction action) const
{
  const State state = Current();
  switch (action)
  {
  case ECalibrationAction::StartCalibration:
  case ECalibrationAction::StartRecalibration:
    return state.phase != Idle ? runs : ObstacleToStart(action, state.target);
  case ECalibrationAction::AcceptTPose:
    return state.phase == FindingTPose ? ""
           : state.phase == Idle       ? nothingRuns
                                       : "The T-pose has been accepted already.";
  case ECalibrationAction::Stop:
    return state.phase == Idle           ? nothingRuns
           : state.phase == FindingTPose ? "The T-pose has not been accepted yet."
                                         : "";
  case ECalibrationAction::Cancel:
    return state.phase == Idle ? nothingRuns : "";
  }
  return "There is no such action.";
}

bool VSubjectCalibrationController::CanPerform(ECalibrationAction action, std::string& reason) const
{
  reason = Obstacle(action);
  return reason.empty();
}

IResult VSubjectCalibrationController::Perform(ECalibrationAction action, TCalibrationSessionId& session)
{
  const std::lock_guard step(m_stepMutex);
  if (!Obstacle(action).empty())
    return EResult::NotAvailable;
  if (action == ECalibrationAction::StartCalibration || action == ECalibrationAction::StartRecalibration)
    return Start(session);
  if (session != Current().run.session)
    return EResult::InvalidSession;
  if (action == ECalibrationAction::AcceptTPose)
  {
    Enter(FirstPass, m_times.calibrating / 2);
    Tell();
    return EResult::Ok;
  }
  return End(action == ECalibrationAction::Stop ? EResult::Ok : EResult::Canceled);
}

IResult VSubjectCalibrationController::Start(TCalibrationSessionId& session)
{
  const State state = Current();
  Run run{TCalibrationSessionId(state.run.session.Value() + 1), state.target};
  const auto editor = m_store->Editor();
  if (const IResult read = NMX::Read(*editor, run.subject, Paths::Calibration(), run.before); read.Failed())
    return read;
  if (const IResult shown = Show(*editor, run.subject, NMX::CalibrationState::running); shown.Failed())
    return shown;
  if (const IResult kept = editor->Commit(); kept.Failed())
    return kept;
  {
    const std::lock_guard lock(m_stateMutex);
    m_state.run = run;
  }
  session = run.session;
  Enter(FindingTPose, m_times.tPose);
  Tell();
  return EResult::Ok;
}

/// The run ends with that result, unless the store cannot keep what comes of it.
IResult VSubjectCalibrationController::End(IResult result)
{
  const Run run = Current().run;
  const auto editor = m_store->Editor();
  NMX::ESubjectKind kind{};
  if (result == EResult::Ok && editor->Kind(run.subject, kind).Failed())
    result = EResult::NotFound;
  if (const IResult shown =
          Show(*editor, run.subject, result == EResult::Ok ? NMX::CalibrationState::done : run.before);
      shown.Failed())
    return shown;
  if (const IResult kept = editor->Commit(); kept.Failed())
    return kept;
  {
    const std::lock_guard lock(m_stateMutex);
    m_state.phase = Idle;
    m_state.lastResult = result;
    m_timer.reset();
  }
  Tell();
  return EResult::Ok;
}

/// Enters a phase, or stays in it, until the time is up.
void VSubjectCalibrationController::Enter(EPhase phase, std::chrono::milliseconds time)
{
  const std::lock_guard lock(m_stateMutex);
  m_state.phase = phase;
  if (m_stopped)
    return;
  m_timer = std::make_unique<boost::asio::steady_timer>(m_postal->Context(), time);
  m_timer->async_wait(
      [weak = weak_from_this(), timer = m_timer.get()](const boost::system::error_code& error)
      {
        const auto self = weak.lock();
        if (!error && self)
          self->OnTime(timer);
      });
}

void VSubjectCalibrationController::OnTime(const boost::asio::steady_timer* timer) noexcept
{
  try
  {
    if (const IResult advanced = Advance(timer); advanced.Failed())
      NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "The end of a subject calibration cannot be kept yet: %1%",
               advanced.Name());
  }
  catch (const std::exception& failure)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "A subject calibration failed: %1%", failure.what());
  }
  catch (...)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "A subject calibration failed.");
  }
}

/// The time of a phase is up.
IResult VSubjectCalibrationController::Advance(const boost::asio::steady_timer* timer)
{
  const std::lock_guard step(m_stepMutex);
  EPhase phase = Idle;
  {
    const std::lock_guard lock(m_stateMutex);
    if (m_timer.get() == timer) // else the run went on just now
      phase = m_state.phase;
  }
  if (phase == Idle)
    return EResult::Ok;
  if (phase == FirstPass)
  {
    Enter(SecondPass, m_times.calibrating - m_times.calibrating / 2);
    Tell();
    return EResult::Ok;
  }
  const IResult ended = End(phase == FindingTPose ? EResult::TimedOut : EResult::Ok);
  if (ended.Failed())
    Enter(phase, retryTime);
  return ended;
}

NMX::TCalibrationSessionId VSubjectCalibrationController::Session() const
{
  return Current().run.session;
}

std::uint32_t VSubjectCalibrationController::Phase() const
{
  return Current().phase;
}

IResult VSubjectCalibrationController::LastResult() const
{
  return Current().lastResult;
}

void VSubjectCalibrationController::Tell()
{
  m_notifications->TellState();
  m_notifications->TellPossibilities();
}

}
