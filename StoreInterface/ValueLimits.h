#pragma once

#include "StoreInterface/Value.h"

#include <cstddef>
#include <string>
#include <string_view>

/// How large what the store keeps may be. The store's editor refuses what is larger; whoever reads files asks before,
/// to tell where it is. [any]
namespace NMX::ValueLimits
{

inline constexpr std::size_t textBytes = 1024; ///< of UTF-8; a group, a label, a URN
inline constexpr std::size_t pathBytes = 4096; ///< of UTF-8; a wide text, and an entry's own path
inline constexpr std::size_t elements = 256;   ///< clusters, slots
inline constexpr std::size_t positions = 4096; ///< markers
inline constexpr std::size_t choices = 4096;   ///< files to choose from
inline constexpr std::size_t entries = 65536;  ///< application entries, with those of devices and presets

[[nodiscard]] bool IsUtf8(std::string_view text);

/// What is wrong with a text, such as "is a text of 1025 bytes, expected at most 1024"; empty when nothing is.
[[nodiscard]] std::string TextProblem(std::string_view text, std::size_t mostBytes = textBytes);

/// The same for a value of any type.
[[nodiscard]] std::string Problem(const Value& value);

/// Whether a value may take the place of `current`. What an earlier version has let in may stay, so that the rest of a
/// list can be edited: texts that are in `current` already, and a list as long as that.
[[nodiscard]] bool Admits(const Value& value, const Value& current);

}
