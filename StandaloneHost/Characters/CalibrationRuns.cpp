#include "StandaloneHost/Characters/CalibrationRuns.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StoreInterface/CalibrationState.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"

#include <boost/asio/io_context.hpp>

#include <exception>
#include <utility>
#include <vector>

namespace Characters
{

using NMX::EResult;
using NMX::IResult;
using NMX::TSubjectStoreId;

namespace
{

/// How long until a state that could not be kept is tried again.
constexpr std::chrono::seconds retryTime{1};

bool IsCalibrating(const NMX::IStoreReader& access, TSubjectStoreId character)
{
  const NMX::Value* state = nullptr;
  return access.Find(character, NMX::Paths::Calibration(), state).Succeeded() && state != nullptr &&
         *state == NMX::Value(NMX::CalibrationState::running);
}

}

CalibrationRuns::CalibrationRuns(std::shared_ptr<NMX::IStore> store, std::shared_ptr<NMX::IAsioPostalService> postal,
                                 std::chrono::milliseconds duration)
    : m_store(std::move(store)), m_postal(std::move(postal)), m_duration(duration)
{
}

void CalibrationRuns::Resume()
{
  std::vector<TSubjectStoreId> interrupted;
  {
    const auto reader = m_store->Reader();
    std::vector<TSubjectStoreId> characters;
    if (reader->Subjects(NMX::ESubjectKind::CharactersFromClusters, characters).Failed())
      return;
    for (const TSubjectStoreId character : characters)
      if (IsCalibrating(*reader, character))
        interrupted.push_back(character);
  }
  for (const TSubjectStoreId character : interrupted)
    Start(character);
}

void CalibrationRuns::Start(TSubjectStoreId character)
{
  const std::lock_guard lock(m_mutex);
  Arm(character, m_duration);
}

void CalibrationRuns::Stop()
{
  const std::lock_guard lock(m_mutex);
  m_stopped = true;
  m_runs.clear();
}

/// Called with the mutex held.
void CalibrationRuns::Arm(TSubjectStoreId character, std::chrono::milliseconds time)
{
  if (m_stopped)
    return;
  auto timer = std::make_unique<boost::asio::steady_timer>(m_postal->Context(), time);
  timer->async_wait(
      [weak = weak_from_this(), character, run = timer.get()](const boost::system::error_code& error)
      {
        const auto self = weak.lock();
        if (!error && self)
          self->Finish(character, run);
      });
  m_runs[character] = std::move(timer);
}

void CalibrationRuns::Finish(TSubjectStoreId character, const boost::asio::steady_timer* run) noexcept
{
  try
  {
    if (const IResult finished = MarkCalibrated(character, run); finished.Failed())
      NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "The calibration of character %1% cannot be kept yet: %2%",
               character, finished.Name());
  }
  catch (const std::exception& failure)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "The calibration of character %1% failed: %2%", character,
             failure.what());
  }
  catch (...)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "The calibration of character %1% failed.", character);
  }
}

IResult CalibrationRuns::MarkCalibrated(TSubjectStoreId character, const boost::asio::steady_timer* run)
{
  // Whoever starts a run holds an edit access too: with this one, nothing comes between.
  const auto editor = m_store->Editor();
  {
    const std::lock_guard lock(m_mutex);
    const auto current = m_runs.find(character);
    if (current == m_runs.end() || current->second.get() != run)
      return EResult::Ok; // it was replaced just now
    m_runs.erase(current);
  }
  if (!IsCalibrating(*editor, character))
    return EResult::Ok;
  if (const IResult set = editor->SetValue(character, NMX::Paths::Calibration(), NMX::CalibrationState::done);
      set.Failed())
    return set;
  const IResult kept = editor->Commit();
  if (kept.Failed())
  {
    const std::lock_guard lock(m_mutex);
    if (!m_runs.contains(character))
      Arm(character, retryTime);
  }
  return kept;
}

}
