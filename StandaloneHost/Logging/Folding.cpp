#include "StandaloneHost/Logging/Folding.h"

#include "StandaloneHost/Logging/LogLine.h"

#include <algorithm>
#include <functional>
#include <utility>

namespace Logging
{

namespace
{

using namespace std::chrono_literals;

constexpr auto timePerByte = Folding::Clock::duration(1s) / static_cast<Folding::Clock::rep>(Folding::bytesPerSecond);
constexpr std::size_t bytesBeforeText = 64;
constexpr std::size_t longestExample = 200;

/// The program has fewer places that log. What comes on top, from a module that makes them up, shares the last one.
constexpr std::size_t maximalPlaces = 512;

}

bool Folding::Place::Matches(const NMX::LogRecord& record) const
{
  return line == record.line && severity == record.severity && file == record.file && channel == record.channel;
}

Folding::Place& Folding::PlaceOf(const NMX::LogRecord& record)
{
  const auto found =
      std::find_if(m_places.begin(), m_places.end(), [&](const Place& place) { return place.Matches(record); });
  if (found != m_places.end())
    return *found;
  if (m_places.size() == maximalPlaces)
    return m_places.back();
  return m_places.emplace_back(
      Place{std::string(record.channel), record.severity, std::string(record.file), record.line});
}

bool Folding::Passes(const NMX::LogRecord& record, Clock::time_point now)
{
  Place& place = PlaceOf(record);
  const auto price = timePerByte * static_cast<Clock::rep>(std::min(record.text.size(), longestText) + bytesBeforeText);
  const auto paidUntil = std::max(place.paidUntil, now) + price;
  const std::size_t text = std::hash<std::string_view>()(record.text);
  const bool repeats = text == place.lastText && now - place.lastPassed < reportTime;
  if (!repeats && paidUntil - now <= timePerByte * static_cast<Clock::rep>(burstBytes))
  {
    place.paidUntil = paidUntil;
    place.lastText = text;
    place.lastPassed = now;
    return true;
  }
  HoldBack(place, record.text, now);
  return false;
}

void Folding::HoldBack(Place& place, std::string_view text, Clock::time_point now)
{
  if (place.heldBack++ != 0)
    return;
  place.heldBackSince = now;
  place.example = text.substr(0, longestExample);
  m_nextReport = std::min(m_nextReport.value_or(now + reportTime), now + reportTime);
}

std::vector<Folding::Report> Folding::Reports(Clock::time_point now, bool all)
{
  std::vector<Report> reports;
  if (!m_nextReport || (!all && now < *m_nextReport))
    return reports;
  m_nextReport.reset();
  for (Place& place : m_places)
  {
    if (place.heldBack == 0)
      continue;
    const auto due = place.heldBackSince + reportTime;
    if (!all && now < due)
    {
      m_nextReport = std::min(m_nextReport.value_or(due), due);
      continue;
    }
    const auto seconds = std::chrono::ceil<std::chrono::seconds>(now - place.heldBackSince).count();
    reports.push_back({place.channel, place.severity,
                       "Left out " + std::to_string(std::exchange(place.heldBack, 0)) + " more like this in " +
                           std::to_string(seconds) + " s: " + place.example});
  }
  return reports;
}

}
