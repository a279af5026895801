#include "StandaloneHost/Evaluation/Comparisons.h"

#include <algorithm>
#include <utility>

namespace Evaluation
{

void Comparisons::Put(Id id, Layout layout)
{
  Touch();
  const auto [place, added] = m_objects.try_emplace(id);
  Object& object = place->second;
  if (!added)
  {
    m_whenDone.insert(object.matchedBy.begin(), object.matchedBy.end());
    Forget(id, object);
    Leave(object.turn);
  }
  m_whenDone.insert(id);
  m_findings.erase(id);
  object.layout = std::move(layout);
  object.turn = ++m_lastTurn;
  const auto turn = m_turns.emplace_hint(m_turns.end(), object.turn, id);
  if (m_current == 0)
    StartTurn(turn);
}

void Comparisons::Remove(Id id)
{
  Touch();
  m_findings[id] = true;
  m_whenDone.erase(id);
  const auto place = m_objects.find(id);
  if (place == m_objects.end())
    return;
  for (const Id other : place->second.matchedBy)
    m_findings[other] = true;
  Forget(id, place->second);
  Leave(place->second.turn);
  m_objects.erase(place);
}

void Comparisons::Touch()
{
  if (Finished())
    m_done = 0;
}

void Comparisons::Restart()
{
  // In the order of their turns, so that the wait stays fair.
  std::vector<std::pair<Id, Layout>> objects;
  for (const auto& [turn, id] : m_turns)
    objects.emplace_back(id, m_objects.at(id).layout);
  auto findings = std::move(m_findings);
  Clear();
  m_findings = std::move(findings);
  for (auto& [id, layout] : objects)
    Put(id, std::move(layout));
}

void Comparisons::Review(Id id)
{
  if (m_objects.contains(id))
    m_whenDone.insert(id);
  else
    m_findings[id] = true;
}

void Comparisons::ReviewAll()
{
  for (const auto& [id, object] : m_objects)
    m_whenDone.insert(id);
}

Comparisons::Layout Comparisons::LayoutOf(Id id) const
{
  const auto object = m_objects.find(id);
  return object != m_objects.end() ? object->second.layout : nullptr;
}

void Comparisons::Clear()
{
  const std::uint64_t lastTurn = m_lastTurn;
  *this = {};
  m_lastTurn = lastTurn;
}

/// Drops what is known of an object's matches.
void Comparisons::Forget(Id id, Object& object)
{
  for (const auto& [other, distance] : object.matches)
    m_objects.at(other).matchedBy.erase(id);
  for (const Id other : object.matchedBy)
    m_objects.at(other).matches.erase(id);
  object.matches.clear();
  object.matchedBy.clear();
}

/// Takes an object out of the queue.
void Comparisons::Leave(std::uint64_t turn)
{
  m_turns.erase(turn);
  if (turn == m_current)
    StartTurn(m_turns.upper_bound(turn));
  else if (m_current == 0 || turn < m_current)
  {
    --m_settled;
    if (turn == m_partner)
      NextPartner();
    else if (turn < m_partner)
      --m_passed;
  }
}

void Comparisons::StartTurn(Turns::const_iterator turn)
{
  m_current = turn != m_turns.end() ? turn->first : 0;
  m_stage = EStage::Itself;
  m_partner = 0;
  m_passed = 0;
}

/// Goes on to the next settled object, or ends the turn after the last.
void Comparisons::NextPartner()
{
  const auto next = m_turns.upper_bound(m_partner);
  if (next->first != m_current)
  {
    m_partner = next->first;
    m_stage = EStage::WithPartner;
    return;
  }
  ++m_settled;
  StartTurn(std::next(next));
}

Comparisons::Comparison Comparisons::Make(std::uint64_t firstTurn, std::uint64_t secondTurn) const
{
  const Id first = m_turns.at(firstTurn);
  const Id second = m_turns.at(secondTurn);
  return {first, second, m_objects.at(first).layout, m_objects.at(second).layout, firstTurn, secondTurn};
}

std::optional<Comparisons::Comparison> Comparisons::Next() const
{
  if (m_current == 0)
    return std::nullopt;
  switch (m_stage)
  {
  case EStage::Itself:
    return Make(m_current, m_current);
  case EStage::WithPartner:
    return Make(m_current, m_partner);
  case EStage::PartnerWithIt:
    return Make(m_partner, m_current);
  }
  return std::nullopt;
}

bool Comparisons::IsNext(const Comparison& comparison) const
{
  const auto next = Next();
  return next && next->firstTurn == comparison.firstTurn && next->secondTurn == comparison.secondTurn;
}

void Comparisons::Finish(const Match& match)
{
  const Comparison comparison = *Next();
  if (match.found)
  {
    m_objects.at(comparison.first).matches[comparison.second] = match.distance;
    m_objects.at(comparison.second).matchedBy.insert(comparison.first);
    m_findings.try_emplace(comparison.first, false);
  }
  m_mostSteps = std::max(m_mostSteps, match.steps);
  ++m_done;
  if (m_stage == EStage::WithPartner)
  {
    m_stage = EStage::PartnerWithIt;
    return;
  }
  if (m_stage == EStage::PartnerWithIt)
    ++m_passed;
  NextPartner();
}

Comparisons::Counts Comparisons::Progress() const
{
  // Of n objects n² comparisons: those of settled objects with each other are done, and a part of the current turn.
  const std::uint64_t all = m_objects.size();
  const std::uint64_t settled = m_settled;
  std::uint64_t done = settled * settled;
  if (m_current != 0 && m_stage != EStage::Itself)
    done += 1 + 2 * m_passed + (m_stage == EStage::PartnerWithIt ? 1 : 0);
  return {m_done, m_done + all * all - done};
}

std::optional<double> Comparisons::Distance(Id first, Id second) const
{
  const auto object = m_objects.find(first);
  if (object == m_objects.end())
    return std::nullopt;
  const auto match = object->second.matches.find(second);
  return match != object->second.matches.end() ? std::optional(match->second) : std::nullopt;
}

std::vector<Comparisons::Finding> Comparisons::TakeFindings()
{
  if (Finished())
    for (const Id id : std::exchange(m_whenDone, {}))
      m_findings[id] = true;
  std::vector<Finding> findings;
  for (const auto& [id, final] : std::exchange(m_findings, {}))
  {
    Finding finding{id, std::nullopt, final};
    if (const auto object = m_objects.find(id); object != m_objects.end())
      for (const auto& [other, distance] : object->second.matches)
        finding.closest = std::min(finding.closest.value_or(distance), distance);
    findings.push_back(finding);
  }
  return findings;
}

}
