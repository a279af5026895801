#pragma once

#include "HostInterface/NMX/ITypedId.h"
#include "StandaloneHost/Evaluation/MarkerLayout.h"
#include "StandaloneHost/Evaluation/MatchSearch.h"

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <vector>

namespace Evaluation
{

/// Which objects are to be compared, what is due, and what has been found: each object with its own other views, and
/// every two of them both ways. Its owner locks.
///
/// Objects queue in the order in which they came or changed. When it is an object's turn, it is compared with all that
/// had their turn before. So a change makes due what it touches and nothing else, and what is due is known without a
/// list of it.
class Comparisons
{
public:
  using Id = NMX::TSubjectStoreId;
  using Layout = std::shared_ptr<const MarkerLayout>;

  struct Comparison
  {
    Id first;
    Id second;
    Layout firstLayout;
    Layout secondLayout;
    std::uint64_t firstTurn; ///< another one as soon as the object changes
    std::uint64_t secondTurn;
  };

  /// How near an object comes to being taken for something else.
  struct Finding
  {
    Id object;
    std::optional<double> closest; ///< distance (mm) of its closest match known
    bool final = false;            ///< nothing is due that could bring a closer one
  };

  struct Counts
  {
    std::uint64_t done = 0;
    std::uint64_t required = 0;
  };

  /// Adds an object, or gives it another layout: all of its comparisons are due.
  void Put(Id object, Layout layout);

  /// An object that is not compared any more; unknown ones too are found to be like nothing.
  void Remove(Id object);

  /// Counting starts anew if all was done: something has changed, whether or not that makes a comparison due.
  void Touch();

  /// Makes every comparison due.
  void Restart();

  /// Has an object, or all, among the findings once all is done, although nothing is due.
  void Review(Id object);
  void ReviewAll();

  /// Forgets everything.
  void Clear();

  /// Whether nothing is due.
  [[nodiscard]] bool Finished() const { return m_settled == m_objects.size(); }

  /// The layout of an object that takes part; null for others.
  [[nodiscard]] Layout LayoutOf(Id object) const;

  /// What is next, if anything is due.
  [[nodiscard]] std::optional<Comparison> Next() const;

  /// Whether that is still next: neither object has changed or gone.
  [[nodiscard]] bool IsNext(const Comparison& comparison) const;

  /// Keeps the result of what is next.
  void Finish(const Match& match);

  /// Comparisons since counting started, and how many there will be.
  [[nodiscard]] Counts Progress() const;

  /// The greatest step count of any comparison since the last Restart or Clear.
  [[nodiscard]] std::uint64_t MostSteps() const { return m_mostSteps; }

  /// The distance of a match that is known, if there is one.
  [[nodiscard]] std::optional<double> Distance(Id first, Id second) const;

  /// Whether TakeFindings would answer any.
  [[nodiscard]] bool HasFindings() const { return !m_findings.empty() || (Finished() && !m_whenDone.empty()); }

  /// What has become known since the last time. While comparisons are due, only what was lost with an object, or what
  /// makes an object look more like another.
  [[nodiscard]] std::vector<Finding> TakeFindings();

private:
  struct Object
  {
    Layout layout;
    std::uint64_t turn = 0;
    std::map<Id, double> matches; ///< distances, by the second object
    std::set<Id> matchedBy;       ///< the objects that match this one
  };

  enum class EStage
  {
    Itself,
    WithPartner,
    PartnerWithIt
  };

  using Turns = std::map<std::uint64_t, Id>;

  void Forget(Id id, Object& object);
  void Leave(std::uint64_t turn);
  void StartTurn(Turns::const_iterator turn);
  void NextPartner();
  [[nodiscard]] Comparison Make(std::uint64_t firstTurn, std::uint64_t secondTurn) const;

  std::map<Id, Object> m_objects;
  Turns m_turns;
  std::uint64_t m_lastTurn = 0;

  // Objects whose turn is over come first in m_turns, then the one whose turn it is, then those that wait.
  std::size_t m_settled = 0;
  std::uint64_t m_current = 0; // whose turn it is; 0: nobody's
  EStage m_stage = EStage::Itself;
  std::uint64_t m_partner = 0; // the settled object that the current one is compared with; 0: not yet any
  std::size_t m_passed = 0;    // settled objects that it has been compared with

  std::uint64_t m_done = 0;
  std::uint64_t m_mostSteps = 0;
  std::map<Id, bool> m_findings; // final?
  std::set<Id> m_whenDone;       // to be among the findings, as final, once nothing is due
};

}
