#pragma once

#include "StandaloneHost/CommandLine/Description.h"

#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace CommandLine
{

/// A word of the command line as JSON, typed by the argument that it stands for. Throws CommandError, which names the
/// argument.
[[nodiscard]] std::string ArgumentJson(const Argument& argument, std::string_view word, const Description& description);

/// The function's inputs as raw JSON, in its order: words by position, or NAME=VALUE where NAME is that of an input.
/// Throws CommandError.
[[nodiscard]] std::vector<std::string> ReadInputs(const Function& function, std::span<const std::string> words,
                                                  const Description& description);

/// The function with its inputs, as it is called on the command line.
[[nodiscard]] std::string CallText(const Function& function);

}
