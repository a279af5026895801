// A subject configuration: a file either loads, or is refused with its name and leaves the store empty.

#include "StandaloneHost/Files/SubjectConfiguration.h"
#include "StandaloneHost/Store/VStore.h"

#include <cstdio>
#include <cstdlib>
#include <unistd.h>

extern "C" int LLVMFuzzerTestOneInput(const unsigned char* data, std::size_t size)
{
  static const std::filesystem::path file = "/tmp/subject-store-fuzz-" + std::to_string(getpid()) + ".xml";
  std::FILE* out = std::fopen(file.c_str(), "wb");
  if (out == nullptr || std::fwrite(data, 1, size, out) != size)
    std::abort();
  std::fclose(out);
  const auto store = NMX::MakeShared<Store::VStore>();
  try
  {
    (void)Files::LoadSubjectConfigurations(*store, std::span(&file, 1));
  }
  catch (const Files::ConfigurationError& failure)
  {
    if (!store->Empty() || std::string_view(failure.what()).find(file.string()) == std::string_view::npos)
      std::abort();
  }
  std::filesystem::remove(file);
  return 0;
}
