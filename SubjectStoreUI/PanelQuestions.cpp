#include "SubjectStoreUI/PanelQuestions.h"

#include "HostInterface/RunaCorePluginInterface/IObjectEvaluationSettings.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/DeviceTypes.h"
#include "RunaCorePluginSubjectStore/Subjects/NameCheck.h"
#include "RunaCorePluginSubjectStore/Subjects/SlotAssignment.h"
#include "StoreInterface/EntryPaths.h"
#include "SubjectStoreUI/PanelBackend.h"
#include "SubjectStoreUI/WarningGadget.h"
#include "SubjectStoreUI/WarningTypes.h"

#include <algorithm>
#include <set>

namespace SubjectStoreUI::PanelQuestions
{

using NMX::ESubjectKind;
using NMX::TSubjectStoreId;
using RunaCorePluginInterface::IPanelServices;
namespace Paths = NMX::Paths;

namespace
{

using Clusters = std::vector<NMX::SmartCluster>;

constexpr qsizetype maximumNameBytes = 255;
constexpr double gapBetweenClusters = 30; // mm

/// All objects, basic and smart.
std::vector<TSubjectStoreId> Objects(const NMX::IStoreReader& access)
{
  std::vector<TSubjectStoreId> objects;
  for (const ESubjectKind kind : {ESubjectKind::BasicObjects, ESubjectKind::SmartObjects})
  {
    std::vector<TSubjectStoreId> ofKind;
    (void)access.Subjects(kind, ofKind);
    objects.insert(objects.end(), ofKind.begin(), ofKind.end());
  }
  return objects;
}

QString NameOf(const NMX::IStoreReader& access, TSubjectStoreId subject)
{
  std::string name;
  (void)NMX::Read(access, subject, Paths::Name(), name);
  return QString::fromStdString(name);
}

/// Sorts maps by the text that they have for a key.
void SortBy(QVariantList& maps, const QString& key)
{
  std::sort(maps.begin(), maps.end(), [&](const QVariant& a, const QVariant& b)
            { return a.toMap()[key].toString().compare(b.toMap()[key].toString(), Qt::CaseInsensitive) < 0; });
}

}

QString NameProblem(const PanelBackend& backend, const QString& name, TSubjectStoreId subject)
{
  const std::string text = name.toStdString();
  if (text.empty())
    return QObject::tr("A name is needed.");
  if (static_cast<qsizetype>(text.size()) > maximumNameBytes)
    return QObject::tr("The name is too long.");
  const auto access = backend.store->Reader();
  TSubjectStoreId known;
  if (access->FindByName(text, known).Succeeded())
    return known == subject ? QString() : QObject::tr("A subject of that name exists already.");
  if (text.front() == ' ' || text.back() == ' ')
    return QObject::tr("A name cannot begin or end with a space.");
  if (Subjects::MatchesPattern(text, access->NamePattern()))
    return {};
  for (const QChar character : name)
    if (QString(R"(/\:*?"<>|)").contains(character))
      return QObject::tr("A name cannot contain \"%1\".").arg(character);
  return QObject::tr("That name is not allowed.");
}

QVariantList CandidatesFor(const PanelBackend& backend, const SelectionItem& slot)
{
  const auto access = backend.store->Reader();
  QVariantList candidates;
  for (const TSubjectStoreId object : Subjects::UnassignedObjects(*access))
    if (Subjects::CheckAssign(*access, object, slot.subject, static_cast<std::uint32_t>(slot.slot)).Succeeded())
      candidates.append(
          QVariantMap{{"id", QVariant::fromValue(VStoreIdGadget(object))}, {"name", NameOf(*access, object)}});
  SortBy(candidates, "name");
  return candidates;
}

QVariantList SlotsFor(const PanelBackend& backend, TSubjectStoreId subject)
{
  const auto access = backend.store->Reader();
  QVariantList places;
  for (const Subjects::EmptySlot& slot : Subjects::EmptySlots(*access))
    if (Subjects::CheckAssign(*access, subject, slot.character, slot.index).Succeeded())
    {
      const VSelectionItemGadget item(slot.character, static_cast<int>(slot.index));
      places.append(
          QVariantMap{{"item", QVariant::fromValue(item)},
                      {"name", NameOf(*access, slot.character) + " / " + QString::fromStdString(slot.slot.name)}});
    }
  return places;
}

QVariantList Markers(const PanelBackend& backend, TSubjectStoreId subject)
{
  using Positions = std::vector<NMX::Position>;
  QVariantList places;
  const auto append = [&](double x, double y, double z, std::uint32_t pattern)
  { places.append(QVariantMap{{"x", x}, {"y", y}, {"z", z}, {"pattern", pattern}}); };
  for (const NMX::EntryPath& path : {Paths::Markers(), Paths::AdditionalMarkerPositions()})
    for (const NMX::Position& marker : backend.Entry<Positions>(subject, path).value_or(Positions{}))
      append(marker.x, marker.y, marker.z, 0);
  double along = 0;
  for (const NMX::SmartCluster& cluster : backend.Entry<Clusters>(subject, Paths::SmartClusters()).value_or(Clusters{}))
  {
    const auto layout = SmartObjectServices::MarkersOf(cluster.type);
    if (layout.empty())
      continue;
    const auto [left, right] = std::ranges::minmax(layout, {}, &RunaCorePluginInterface::MarkerPlace::x);
    // The first cluster lies at the origin, each of the others beside the one before it.
    const double shift = along == 0 ? 0 : along - left.x;
    for (const auto& marker : layout)
      append(marker.x + shift, marker.y, marker.z, cluster.pattern);
    along = right.x + shift + gapBetweenClusters;
  }
  return places;
}

QVariantList ConfusableWith(const PanelBackend& backend, TSubjectStoreId subject)
{
  const auto evaluation = backend.Get(&IPanelServices::ObjectEvaluationSettings);
  QVariantList found;
  if (!evaluation)
    return found;
  const auto access = backend.store->Reader();
  for (const TSubjectStoreId other : Objects(*access))
  {
    bool matches = false;
    double distance = 0;
    if (evaluation->MatchDistance(*access, subject, other, matches, distance).Succeeded() && matches)
      found.append(QVariantMap{{"id", QVariant::fromValue(VStoreIdGadget(other))},
                               {"name", NameOf(*access, other)},
                               {"distance", distance}});
  }
  std::stable_sort(found.begin(), found.end(), [](const QVariant& a, const QVariant& b)
                   { return a.toMap()["distance"].toDouble() < b.toMap()["distance"].toDouble(); });
  return found;
}

QVariantList WarningsOf(const PanelBackend& backend, TSubjectStoreId subject)
{
  QVariantList warnings;
  const auto access = backend.store->Reader();
  const auto types = WarningTypes();
  for (std::size_t type = 1; type < types.size(); ++type)
  {
    const NMX::Value* value = nullptr;
    (void)access->Find(subject, NMX::EntryPath("Warnings/" + std::string(types[type].key)), value);
    const bool* holds = value != nullptr ? std::get_if<bool>(value) : nullptr;
    if (holds == nullptr || !*holds)
      continue;
    const std::string_view text = types[type].ofOne;
    warnings.append(QVariant::fromValue(
        VWarningGadget{static_cast<int>(type), QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()))}));
  }
  return warnings;
}

QStringList Texts(const PanelBackend& backend, NMX::EntryPath path)
{
  std::set<QString> texts;
  const auto access = backend.store->Reader();
  for (const TSubjectStoreId id : Objects(*access))
    if (std::string text; NMX::Read(*access, id, path, text).Succeeded() && !text.empty())
      texts.insert(QString::fromStdString(text));
  return {texts.begin(), texts.end()};
}

}
