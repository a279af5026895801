#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <ostream>
#include <string_view>

namespace NMX
{

/// The kinds of subject. Every subject is of one kind for as long as it lives.
enum class ESubjectKind : std::uint8_t
{
  BasicObjects,
  SmartObjects,
  CharactersFromClusters,
  GeneralSubjects,
  LabellingClusters,
  Markerless,
  Props,
  SceneMeshes
};

inline constexpr std::array allSubjectKinds{
    ESubjectKind::BasicObjects,    ESubjectKind::SmartObjects,      ESubjectKind::CharactersFromClusters,
    ESubjectKind::GeneralSubjects, ESubjectKind::LabellingClusters, ESubjectKind::Markerless,
    ESubjectKind::Props,           ESubjectKind::SceneMeshes};

/// The key of a kind under "Subjects", such as "BasicObjects".
[[nodiscard]] std::string_view KindKey(ESubjectKind kind);

/// The kind with that key.
[[nodiscard]] std::optional<ESubjectKind> KindFromKey(std::string_view key);

std::ostream& operator<<(std::ostream& out, ESubjectKind kind);

/// Bits of a subject's flag word ("Parameters/Flags"). The two lowest are also the answer to the object-kind question.
namespace SubjectFlag
{
inline constexpr std::uint32_t rigid = 0x1; ///< an object, basic or smart
inline constexpr std::uint32_t smart = 0x2; ///< an object with active markers
inline constexpr std::uint32_t labellingCluster = 0x4;
inline constexpr std::uint32_t solvedFromClusters = 0x8;
inline constexpr std::uint32_t prop = 0x10;
inline constexpr std::uint32_t subjectTemplate = 0x20;
inline constexpr std::uint32_t wand = 0x40;
inline constexpr std::uint32_t installed = 0x80;
inline constexpr std::uint32_t sceneMesh = 0x100;
inline constexpr std::uint32_t markerless = 0x200;
inline constexpr std::uint32_t objectKindMask = rigid | smart;
}

/// The flags that follow from the kind alone.
[[nodiscard]] std::uint32_t KindFlags(ESubjectKind kind);

}
