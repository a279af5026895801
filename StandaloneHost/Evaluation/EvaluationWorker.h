#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "StandaloneHost/Evaluation/Bell.h"
#include "StandaloneHost/Evaluation/Comparisons.h"
#include "StandaloneHost/Evaluation/EvaluatedObject.h"
#include "StandaloneHost/Evaluation/EvaluationSettings.h"
#include "StoreInterface/IStore.h"

#include <atomic>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <thread>
#include <vector>

namespace Evaluation
{

/// The thread that compares objects and keeps their warnings, and what it knows. [any]
///
/// It looks at the store when told of a change, and between the steps of a comparison at that. A comparison is given up
/// only when one of its two objects has changed, a setting, or when the thread is to end.
class EvaluationWorker
{
public:
  using Id = NMX::TSubjectStoreId;

  explicit EvaluationWorker(std::shared_ptr<NMX::IStore> store);
  EvaluationWorker(const EvaluationWorker&) = delete;
  EvaluationWorker& operator=(const EvaluationWorker&) = delete;
  ~EvaluationWorker();

  void Stop();

  [[nodiscard]] Comparisons::Counts Progress() const;
  [[nodiscard]] std::uint64_t MostSteps() const;

  /// An object in the form that a caller sees.
  struct Seen
  {
    Id id;
    NMX::ChangeStamps stamps;
  };

  /// The distance of a match between these objects in just these forms, if one is known. `comparable` tells whether
  /// both can be compared at all.
  [[nodiscard]] std::optional<double> Distance(const Seen& first, const Seen& second, bool& comparable) const;

  /// Handlers are called on the worker's thread.
  [[nodiscard]] NMX::Subscription OnChange(std::function<void()> handler);

private:
  using Clock = std::chrono::steady_clock;

  struct Known
  {
    NMX::ChangeStamps stamps;
    bool comparable = true;
  };

  /// What an object is now that is not as it is known.
  struct Difference
  {
    Id id;
    Known known;
    bool otherObject = true; ///< rather than other warnings only
    EvaluatedObject object;
    Comparisons::Layout layout;
  };

  void Run();
  void Work();
  void Attend();
  void Look();
  void Subscribe(bool enabled);
  void TakeOver(const EvaluationSettings& settings);
  [[nodiscard]] std::vector<Difference> FindDifferences(const NMX::IStoreReader& reader, std::vector<Id>& gone) const;
  void TakeOver(const Difference& difference);
  void Compare(const Comparisons::Comparison& comparison);
  void Report();
  void Tell();
  void Wait();

  const std::shared_ptr<NMX::IStore> m_store;
  const std::shared_ptr<Bell> m_bell = std::make_shared<Bell>();
  std::atomic<bool> m_stop = false;

  // The worker's own.
  NMX::Subscription m_settingChanges;
  std::vector<NMX::Subscription> m_objectChanges; // while evaluation is on
  EvaluationSettings m_settings;
  MatchSearch m_search;
  Clock::time_point m_nextLook;
  Clock::time_point m_nextReport;
  Clock::time_point m_retryReport; // after a failure
  Clock::time_point m_nextTelling;
  bool m_untold = false; // something has changed that handlers have not been told of

  // Changed by the worker only; others read under the mutex.
  mutable std::mutex m_mutex;
  Comparisons m_comparisons;
  std::map<Id, Known> m_known;
  bool m_looking = false;
  bool m_reporting = false;

  std::mutex m_handlerMutex;
  std::vector<std::weak_ptr<const std::function<void()>>> m_handlers;

  std::thread m_thread; // last: it uses all the others
};

}
