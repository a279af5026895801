#pragma once

#include "HostInterface/NMX/IAsioPostalService.h"
#include "StoreInterface/IStore.h"

#include <boost/asio/steady_timer.hpp>

#include <chrono>
#include <map>
#include <memory>
#include <mutex>

namespace Characters
{

/// The calibrations of characters that run. There is nobody to be measured: a run takes its time, and then the
/// character is calibrated, provided that it is still calibrating. [any]
class CalibrationRuns : public std::enable_shared_from_this<CalibrationRuns>
{
public:
  CalibrationRuns(std::shared_ptr<NMX::IStore> store, std::shared_ptr<NMX::IAsioPostalService> postal,
                  std::chrono::milliseconds duration);

  /// Starts a run for each character that the store has as calibrating: those that the host's end interrupted.
  void Resume();

  /// Starts the run of a character; one that it has already ends without effect.
  void Start(NMX::TSubjectStoreId character);

  /// Cancels all runs for good.
  void Stop();

private:
  void Finish(NMX::TSubjectStoreId character, const boost::asio::steady_timer* run) noexcept;
  NMX::IResult MarkCalibrated(NMX::TSubjectStoreId character, const boost::asio::steady_timer* run);
  void Arm(NMX::TSubjectStoreId character, std::chrono::milliseconds time);

  const std::shared_ptr<NMX::IStore> m_store;
  const std::shared_ptr<NMX::IAsioPostalService> m_postal;
  const std::chrono::milliseconds m_duration;
  std::mutex m_mutex; // taken while the store is being edited, never the other way round
  std::map<NMX::TSubjectStoreId, std::unique_ptr<boost::asio::steady_timer>> m_runs;
  bool m_stopped = false;
};

}
