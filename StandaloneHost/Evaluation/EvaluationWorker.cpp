#include "StandaloneHost/Evaluation/EvaluationWorker.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Evaluation/ConfusionWarnings.h"
#include "StandaloneHost/Evaluation/EvaluatedObject.h"

#include <algorithm>
#include <exception>
#include <utility>

namespace Evaluation
{

namespace
{

using namespace std::chrono_literals;

/// Between two looks at the store passes this at least, and so many times what a look took: editors must not wait for
/// it.
constexpr auto pauseBetweenLooks = 10ms;
constexpr int pauseForLook = 4;

constexpr auto pauseBetweenReports = 100ms;
constexpr auto pauseBetweenTellings = 100ms;
constexpr auto pauseAfterFailure = 1s;

}

EvaluationWorker::EvaluationWorker(std::shared_ptr<NMX::IStore> store)
    : m_store(std::move(store)), m_settingChanges(m_store->OnChange(SettingPaths::all, m_bell, [] {}))
{
  m_bell->Ring(); // there is a first look to take
  m_thread = std::thread([this] { Run(); });
}

EvaluationWorker::~EvaluationWorker()
{
  Stop();
}

void EvaluationWorker::Stop()
{
  m_stop = true;
  m_bell->WakeForGood();
  if (m_thread.joinable())
    m_thread.join();
}

void EvaluationWorker::Run()
{
  m_bell->Listen();
  while (!m_stop)
  {
    try
    {
      Work();
      return;
    }
    catch (const std::exception& failure)
    {
      NMX::Log(NMX::systemLog, NMX::ESeverity::Critical, "Object evaluation failed and starts anew: %1%",
               failure.what());
    }
    catch (...)
    {
      NMX::Log(NMX::systemLog, NMX::ESeverity::Critical, "Object evaluation failed and starts anew.");
    }
    m_bell->Wait(Clock::now() + pauseAfterFailure, true);
    const std::lock_guard lock(m_mutex);
    m_comparisons.Clear();
    m_known.clear();
    m_looking = false;
    m_reporting = false;
    m_bell->Ring();
  }
}

void EvaluationWorker::Work()
{
  while (!m_stop)
  {
    Attend();
    std::optional<Comparisons::Comparison> next;
    {
      const std::lock_guard lock(m_mutex);
      next = m_comparisons.Next();
    }
    if (next)
      Compare(*next);
    else
      Wait();
  }
}

/// What is not to wait until a comparison has come to its end.
void EvaluationWorker::Attend()
{
  const auto now = Clock::now();
  if (m_bell->Rung() && now >= m_nextLook)
    Look();
  bool finished = false;
  bool findings = false;
  {
    const std::lock_guard lock(m_mutex);
    finished = m_comparisons.Finished();
    findings = m_comparisons.HasFindings();
  }
  if (findings && now >= m_retryReport && (finished || now >= m_nextReport))
    Report();
  if (m_untold && (finished || now >= m_nextTelling))
    Tell();
}

/// Takes over what has changed in the store.
void EvaluationWorker::Look()
{
  const auto start = Clock::now();
  {
    const std::lock_guard lock(m_mutex);
    m_looking = true;
    m_bell->Silence();
  }
  const bool enabled = ReadSettings(*m_store->Reader()).enabled;
  Subscribe(enabled);
  EvaluationSettings settings;
  std::vector<Difference> differences;
  std::vector<Id> gone;
  {
    const auto reader = m_store->Reader();
    settings = ReadSettings(*reader);
    settings.enabled = settings.enabled && enabled;
    if (settings.enabled)
      differences = FindDifferences(*reader, gone);
  }
  for (Difference& difference : differences)
    difference.layout = MakeLayout(std::move(difference.object));
  const std::lock_guard lock(m_mutex);
  TakeOver(settings);
  for (const Difference& difference : differences)
    TakeOver(difference);
  for (const Id id : gone)
  {
    m_known.erase(id);
    m_comparisons.Remove(id);
    m_untold = true;
  }
  m_looking = false;
  const auto end = Clock::now();
  m_nextLook = end + std::max<Clock::duration>(pauseBetweenLooks, pauseForLook * (end - start));
}

/// Objects are of interest while evaluation is on.
void EvaluationWorker::Subscribe(bool enabled)
{
  if (!enabled)
    m_objectChanges.clear();
  else if (m_objectChanges.empty())
    for (const NMX::ESubjectKind kind : objectKinds)
      m_objectChanges.push_back(m_store->SubjectsChanged(kind)->Subscribe(m_bell, [] {}));
}

void EvaluationWorker::TakeOver(const EvaluationSettings& settings)
{
  if (settings == m_settings)
    return;
  const EvaluationSettings before = std::exchange(m_settings, settings);
  m_untold = true;
  if (!settings.enabled)
  {
    m_comparisons.Clear();
    m_known.clear();
  }
  else if (settings.maximumSteps != before.maximumSteps || settings.Reach() != before.Reach())
    m_comparisons.Restart();
  else
    m_comparisons.ReviewAll();
}

std::vector<EvaluationWorker::Difference> EvaluationWorker::FindDifferences(const NMX::IStoreReader& reader,
                                                                            std::vector<Id>& gone) const
{
  std::vector<Id> ids;
  for (const NMX::ESubjectKind kind : objectKinds)
  {
    std::vector<Id> ofKind;
    if (reader.Subjects(kind, ofKind).Succeeded())
      ids.insert(ids.end(), ofKind.begin(), ofKind.end());
  }
  std::sort(ids.begin(), ids.end());

  std::vector<Difference> differences;
  auto known = m_known.begin();
  for (const Id id : ids)
  {
    for (; known != m_known.end() && known->first < id; ++known)
      gone.push_back(known->first);
    const Known* before = known != m_known.end() && known->first == id ? &(known++)->second : nullptr;
    Difference difference{id, {}, true, {}, nullptr};
    if (reader.Stamps(id, difference.known.stamps).Failed() ||
        (before != nullptr && before->stamps == difference.known.stamps))
      continue;
    if (before != nullptr && !MayDiffer(before->stamps, difference.known.stamps))
    {
      difference.otherObject = false;
      difference.known.comparable = before->comparable;
    }
    else
    {
      difference.object = ReadObject(reader, id);
      difference.known.comparable = difference.object.comparable;
    }
    differences.push_back(std::move(difference));
  }
  for (; known != m_known.end(); ++known)
    gone.push_back(known->first);
  return differences;
}

void EvaluationWorker::TakeOver(const Difference& difference)
{
  m_known[difference.id] = difference.known;
  if (!difference.otherObject)
  {
    m_comparisons.Review(difference.id);
    return;
  }
  m_untold = true;
  m_comparisons.Touch();
  const Comparisons::Layout before = m_comparisons.LayoutOf(difference.id);
  if (!difference.layout)
    m_comparisons.Remove(difference.id);
  else if (!before || *before != *difference.layout)
    m_comparisons.Put(difference.id, difference.layout);
}

void EvaluationWorker::Compare(const Comparisons::Comparison& comparison)
{
  bool givenUp = false;
  const auto keepGoing = [&]
  {
    Attend();
    const std::lock_guard lock(m_mutex);
    givenUp = m_stop || !m_comparisons.IsNext(comparison);
    return !givenUp;
  };
  const SearchLimits limits{m_settings.Reach(), m_settings.maximumSteps};
  const Match match = comparison.first == comparison.second
                          ? m_search.RunOnItself(*comparison.firstLayout, limits, keepGoing)
                          : m_search.Run(*comparison.firstLayout, *comparison.secondLayout, limits, keepGoing);
  if (givenUp)
    return;
  const std::lock_guard lock(m_mutex);
  m_comparisons.Finish(match);
  m_untold = true;
}

/// Writes what has been found into the store.
void EvaluationWorker::Report()
{
  std::vector<Comparisons::Finding> findings;
  {
    const std::lock_guard lock(m_mutex);
    findings = m_comparisons.TakeFindings();
    m_reporting = true;
  }
  bool changed = false;
  const NMX::IResult written = WriteWarnings(*m_store, findings, changed);
  const auto now = Clock::now();
  m_nextReport = now + pauseBetweenReports;
  m_untold = m_untold || changed;
  const std::lock_guard lock(m_mutex);
  m_reporting = false;
  if (written.Succeeded())
    return;
  NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "The warnings of object evaluation cannot be kept: %1%",
           written.Name());
  m_retryReport = now + pauseAfterFailure;
  for (const auto& finding : findings)
    m_comparisons.Review(finding.object);
}

void EvaluationWorker::Tell()
{
  m_untold = false;
  m_nextTelling = Clock::now() + pauseBetweenTellings;
  std::vector<std::shared_ptr<const std::function<void()>>> handlers;
  {
    const std::lock_guard lock(m_handlerMutex);
    for (const auto& known : m_handlers)
      if (auto handler = known.lock())
        handlers.push_back(std::move(handler));
  }
  for (const auto& handler : handlers)
    (*handler)();
}

/// Waits until there may be something to do.
void EvaluationWorker::Wait()
{
  const bool rung = m_bell->Rung();
  std::optional<Bell::Time> end;
  if (rung)
    end = m_nextLook;
  {
    const std::lock_guard lock(m_mutex);
    if (m_comparisons.HasFindings())
      end = std::min(end.value_or(m_retryReport), m_retryReport);
  }
  m_bell->Wait(end, rung);
}

NMX::Subscription EvaluationWorker::OnChange(std::function<void()> handler)
{
  auto subscription = std::make_shared<const std::function<void()>>(std::move(handler));
  const std::lock_guard lock(m_handlerMutex);
  std::erase_if(m_handlers, [](const auto& known) { return known.expired(); });
  m_handlers.emplace_back(subscription);
  return subscription;
}

Comparisons::Counts EvaluationWorker::Progress() const
{
  const std::lock_guard lock(m_mutex);
  Comparisons::Counts counts = m_comparisons.Progress();
  if (!m_comparisons.Finished())
    return counts;
  // What has changed since will be counted anew.
  if (m_looking || m_bell->Rung())
    return {};
  // An update is not done before its warnings are.
  if (counts.done > 0 && (m_reporting || m_comparisons.HasFindings()))
    --counts.done;
  return counts;
}

std::uint64_t EvaluationWorker::MostSteps() const
{
  const std::lock_guard lock(m_mutex);
  return m_comparisons.MostSteps();
}

std::optional<double> EvaluationWorker::Distance(const Seen& first, const Seen& second, bool& comparable) const
{
  const std::lock_guard lock(m_mutex);
  comparable = true;
  for (const Seen& seen : {first, second})
  {
    const auto known = m_known.find(seen.id);
    if (known == m_known.end() || MayDiffer(known->second.stamps, seen.stamps))
      return std::nullopt;
    comparable = comparable && known->second.comparable;
  }
  return m_comparisons.Distance(first.id, second.id);
}

}
