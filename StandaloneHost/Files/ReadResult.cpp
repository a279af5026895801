#include "StandaloneHost/Files/ReadResult.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Files/ConfigurationError.h"

namespace Files
{

NMX::IResult ReportUnusable(std::string_view what)
{
  const auto report = [what](const char* reason, NMX::EResult result)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "The %1% cannot be used: %2%", what, reason);
    return result;
  };
  try
  {
    throw;
  }
  catch (const UnreadableFileError& failure)
  {
    return report(failure.what(), NMX::EResult::FileIOFailure);
  }
  catch (const ConfigurationError& failure)
  {
    return report(failure.what(), NMX::EResult::SerialisationFailure);
  }
}

}
