#pragma once

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Calibration/VSubjectCalibrationController.h"
#include "StandaloneHost/Server/VServer.h"

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

/// A command line that cannot be followed; the text is for people.
class OptionError : public std::runtime_error
{
public:
  using std::runtime_error::runtime_error;
};

/// What the command line asks for.
struct Options
{
  std::vector<std::filesystem::path> configurations; ///< loaded when the store is empty
  std::optional<std::filesystem::path> dataFolder;   ///< none: nothing is kept
  Server::ServerOptions server;
  std::uint32_t features = 0xFFFFFFFF;
  std::chrono::milliseconds characterCalibrationTime{3000};
  Calibration::CalibrationTimes subjectCalibrationTimes;
  bool headless = false;
  std::filesystem::path readyFile;  ///< empty: none
  std::filesystem::path pluginFile; ///< empty: the one that was built with the host
  NMX::ESeverity logLevel = NMX::ESeverity::Notice;
};

/// What the host can be asked to do.
struct Request
{
  bool help = false;
  std::string helpText;
  Options options;
};

/// Reads the command line. Throws OptionError.
[[nodiscard]] Request ReadOptions(int argumentCount, const char* const* arguments);
