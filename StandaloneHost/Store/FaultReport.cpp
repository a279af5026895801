#include "StandaloneHost/Store/FaultReport.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Store/SqliteDatabase.h"

#include <algorithm>
#include <utility>

namespace Store
{

using NMX::ESeverity;
using NMX::Log;
using NMX::systemLog;
using namespace std::chrono_literals;

namespace
{

constexpr int restPerAttempt = 9; // so many times as long as the attempt took
constexpr auto longestRest = 2s;
constexpr auto timeBetweenLines = 60s;

}

bool FaultReport::RefusesUntried()
{
  const bool refuses = m_active && Clock::now() < m_nextAttempt;
  m_refused += refuses;
  return refuses;
}

void FaultReport::Failed(const DatabaseError& failure, Clock::time_point begin)
{
  const auto now = Clock::now();
  ++m_refused;
  m_result = failure.Result();
  m_nextAttempt = now + std::min<Clock::duration>(restPerAttempt * (now - begin), longestRest);
  SetReason(failure.what());
  if (!m_active)
    Log(systemLog, ESeverity::Error,
        "The store \"%1%\" cannot keep changes: %2%. Until this is put right every edit is refused and changes "
        "nothing; "
        "reading goes on.",
        m_file, failure.what());
  else if (now >= m_nextLine)
    Log(systemLog, ESeverity::Error, "The store \"%1%\" still cannot keep changes: %2%. It has refused %3% edits.",
        m_file, failure.what(), m_refused);
  if (!m_active || now >= m_nextLine)
    m_nextLine = now + timeBetweenLines;
  if (!std::exchange(m_active, true))
    m_since = now;
}

void FaultReport::Succeeded(bool madeAnew)
{
  const char* const anew =
      madeAnew ? " Its file was gone and has been written anew, with all that the store holds." : "";
  if (m_active)
    Log(systemLog, ESeverity::Notice, "The store \"%1%\" keeps changes again. In %2% s it has refused %3% edits.%4%",
        m_file, std::chrono::duration_cast<std::chrono::seconds>(Clock::now() - m_since).count(), m_refused, anew);
  else if (madeAnew)
    Log(systemLog, ESeverity::Warning,
        "The file of the store \"%1%\" was gone and has been written anew, with all that the store holds.", m_file);
  if (m_active)
    SetReason({});
  m_active = false;
  m_refused = 0;
  m_result = NMX::EResult::Ok;
}

void FaultReport::EndsWith(const DatabaseError& failure, bool fileIsWhole, std::size_t subjects)
{
  if (fileIsWhole)
    Log(systemLog, ESeverity::Warning,
        "The store \"%1%\" ends while it cannot keep changes: %2%. All edits are in it but the %3% that were refused.",
        m_file, failure.what(), m_refused);
  else
    Log(systemLog, ESeverity::Error,
        "The store \"%1%\" ends, and the %3% subjects that it held are not in that file: %2%.", m_file, failure.what(),
        subjects);
}

std::string FaultReport::Text() const
{
  const std::lock_guard lock(m_mutex);
  return m_reason;
}

void FaultReport::SetReason(std::string reason)
{
  const std::lock_guard lock(m_mutex);
  m_reason = std::move(reason);
}

}
