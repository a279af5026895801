#include "StandaloneHost/Files/ReadResult.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Files/ConfigurationError.h"

namespace Files
{

NMX::IResult ReportUnusable(std::string_view what)
{
  try
  {
    throw;
  }
  catch (const ConfigurationError& failure)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "The %1% cannot be used: %2%", what, failure.what());
    return failure.Result();
  }
}

}
