// A smart-object template: a file either reads as what a template promises, or is refused with its name.

#include "StandaloneHost/SmartObjects/TemplateFile.h"

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <set>
#include <string_view>
#include <unistd.h>

namespace
{

bool Sound(const SmartObjects::SmartObjectTemplate& read)
{
  std::set<std::string_view> labels;
  for (const auto& [label, type] : read.clusters)
    if (label.empty() || type.empty() || !labels.insert(label).second)
      return false;
  for (const NMX::Position& marker : read.additionalMarkers)
    if (!std::isfinite(marker.x) || !std::isfinite(marker.y) || !std::isfinite(marker.z))
      return false;
  return !read.clusters.empty() && read.clusters.size() <= 64;
}

}

extern "C" int LLVMFuzzerTestOneInput(const unsigned char* data, std::size_t size)
{
  static const std::filesystem::path file = "/tmp/subject-store-fuzz-" + std::to_string(getpid()) + ".sot";
  std::FILE* out = std::fopen(file.c_str(), "wb");
  if (out == nullptr || std::fwrite(data, 1, size, out) != size)
    std::abort();
  std::fclose(out);
  try
  {
    if (!Sound(SmartObjects::ReadTemplate(file)))
      std::abort();
  }
  catch (const Files::ConfigurationError& failure)
  {
    if (!std::string_view(failure.what()).starts_with(file.string() + ':'))
      std::abort();
  }
  std::filesystem::remove(file);
  return 0;
}
