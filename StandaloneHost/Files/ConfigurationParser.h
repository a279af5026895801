#pragma once

#include "StandaloneHost/Files/ConfigurationContent.h"

#include <filesystem>

namespace Files
{

/// Adds what a file says to `content`, whose places then name `file`. Throws ConfigurationError. [any]
void ParseConfiguration(const std::filesystem::path& file, ConfigurationContent& content);

}
