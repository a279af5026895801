#include "StandaloneHost/Files/ReadResult.h"

#include "HostInterface/NMX/GlobalLog.h"

namespace Files
{

void ReportUnusable(std::string_view what, std::string_view problem)
{
  if (!problem.empty())
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "The %1% cannot be used: %2%", what, problem);
}

}
