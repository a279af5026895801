#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"

#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <string_view>
#include <unistd.h>

/// Hands the input as a file to a template's reader: `sound` holds for what it reads, or it refuses the content with a
/// message that begins with the file's name.
template <class Read, class Sound>
int ReadsSoundOrRefuses(const unsigned char* data, std::size_t size, Read read, Sound sound)
{
  static const std::filesystem::path file = "/tmp/subject-store-fuzz-" + std::to_string(getpid());
  std::FILE* out = std::fopen(file.c_str(), "wb");
  if (out == nullptr || std::fwrite(data, 1, size, out) != size)
    std::abort();
  std::fclose(out);
  try
  {
    if (!sound(read(file)))
      std::abort();
  }
  catch (const Files::UnreadableFileError&)
  {
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
