#include "StoreInterface/SubjectKind.h"

namespace NMX
{

namespace
{

struct Kind
{
  std::string_view key;
  std::uint32_t flags;
};

constexpr std::array<Kind, allSubjectKinds.size()> kinds{{
    {"BasicObjects", SubjectFlag::rigid},
    {"SmartObjects", SubjectFlag::rigid | SubjectFlag::smart},
    {"CFCs", SubjectFlag::solvedFromClusters},
    {"GeneralSubjects", 0},
    {"LabellingClusters", SubjectFlag::labellingCluster},
    {"Markerless", SubjectFlag::markerless},
    {"Props", SubjectFlag::prop},
    {"SceneMeshes", SubjectFlag::sceneMesh},
}};

}

std::string_view KindKey(ESubjectKind kind)
{
  return kinds[static_cast<std::size_t>(kind)].key;
}

std::optional<ESubjectKind> KindFromKey(std::string_view key)
{
  for (const ESubjectKind kind : allSubjectKinds)
    if (KindKey(kind) == key)
      return kind;
  return std::nullopt;
}

std::uint32_t KindFlags(ESubjectKind kind)
{
  return kinds[static_cast<std::size_t>(kind)].flags;
}

std::ostream& operator<<(std::ostream& out, ESubjectKind kind)
{
  return out << KindKey(kind);
}

}
