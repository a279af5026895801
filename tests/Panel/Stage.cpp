#include "tests/Panel/Stage.h"

#include "HostInterface/IFileLocations.h"
#include "HostInterface/RunaCorePluginInterface/IAccessRights.h"
#include "HostInterface/RunaCorePluginInterface/IUserInterface.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/DeviceTypes.h"
#include "StandaloneHost/Calibration/VCalibrationProvider.h"
#include "StandaloneHost/Characters/VCharacterControls.h"
#include "StandaloneHost/Evaluation/VObjectEvaluationEngine.h"
#include "StandaloneHost/FileIO/VRunaCoreFileIO.h"
#include "StandaloneHost/Panel/VObjectPresetProvider.h"
#include "StandaloneHost/Panel/VOfflineStoreServices.h"
#include "StandaloneHost/Panel/VPanelServices.h"
#include "StandaloneHost/Panel/VSelectionManager.h"
#include "StandaloneHost/Postal/VAsioPostalService.h"
#include "StandaloneHost/Postal/VGuiPostalService.h"
#include "StandaloneHost/Settings/PanelSettings.h"
#include "StandaloneHost/Simulation/VDeviceServices.h"
#include "StandaloneHost/SmartObjects/AutoPatternManagement.h"
#include "StandaloneHost/SmartObjects/VSmartObjectControls.h"
#include "StandaloneHost/Store/VStore.h"
#include "StandaloneHost/VPluginHost.h"
#include "StoreInterface/ColourText.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"
#include "tests/Support/TemporaryFolder.h"

#include <QFile>

#include <fstream>
#include <optional>

namespace Paths = NMX::Paths;
using NMX::TSubjectStoreId;

namespace
{

/// Files that come with the host, and a user's folder.
struct Locations final : IFileLocations
{
  explicit Locations(std::filesystem::path userFolder) : user(std::move(userFolder)) {}

  std::vector<std::wstring> Directories(std::uint32_t location) const override
  {
    const std::filesystem::path host = std::filesystem::path(SUBJECT_STORE_SOURCE_DIR) / "StandaloneHost";
    switch (location)
    {
    case smartObjectTemplates:
      return {(host / "SmartObjects/Templates").wstring(), UserDirectory(location)};
    case characterTemplates:
      return {(host / "Characters/Templates").wstring(), UserDirectory(location)};
    case subjectTemplates:
      return {(host / "Calibration/Templates").wstring(), UserDirectory(location)};
    case subjectSkins:
      return {(host / "Calibration/Skins").wstring(), UserDirectory(location)};
    default:
      return {UserDirectory(location)};
    }
  }
  std::wstring UserDirectory(std::uint32_t location) const override
  {
    return (user / ("user" + std::to_string(location))).wstring();
  }
  std::vector<std::filesystem::path> Folders(std::uint32_t location) const
  {
    std::vector<std::filesystem::path> folders;
    for (const std::wstring& folder : Directories(location))
      folders.emplace_back(folder);
    return folders;
  }
  const std::filesystem::path user;
};

struct OneCommand final : RunaCorePluginInterface::IUserInterface
{
  std::uint32_t ThemeColour(std::string_view) const override { return 0xFF808080; }
  void AddCommand(RunaCorePluginInterface::MenuCommand added) override { command = std::move(added); }
  RunaCorePluginInterface::MenuCommand command;
};

std::string Text(const QString& text)
{
  return text.toStdString();
}

}

struct Stage::Services
{
  explicit Services(Stage& stage)
  {
    const auto settings =
        std::make_shared<VPluginSettings>(0xFFFFFFFF, HostSettings{locations, smartObjects, evaluation, characters});
    std::shared_ptr<RunaCorePluginInterface::IFeatures> features;
    settings->Features(features);
    (void)Settings::SetUpPanelSettings(*store, {locations->Folders(IFileLocations::characterTemplates),
                                                locations->Folders(IFileLocations::smartObjectTemplates),
                                                locations->Folders(IFileLocations::subjectTemplates),
                                                locations->Folders(IFileLocations::subjectSkins),
                                                locations->Folders(IFileLocations::retargets)});
    SmartObjectServices::RegisterDeviceTypes(*layouts);
    calibration->Open(gui);
    HostServices services;
    services.store = store;
    services.notificationPostal = postal;
    services.settings = settings;
    services.deviceLayouts = layouts;
    services.calibration = calibration;
    services.guiPostal = gui;
    services.fileIO = fileIO;
    services.selection = selection;
    services.panel = std::make_shared<Panel::VPanelServices>(Panel::ServicesForPanel{
        features, fileIO, locations, evaluation, smartObjects, characters, devices, calibration});
    services.objectPresets = std::make_shared<Panel::VObjectPresetProvider>();
    services.offlineStore = std::make_shared<Panel::VOfflineStoreServices>(store, gui);
    host.emplace(std::move(services));
    (void)plugin->RegisterQml(*host, stage);
    (void)plugin->RegisterUserInterface(*host, userInterface);
  }

  ~Services()
  {
    characters->Stop();
    calibration->Stop();
    devices->Stop();
    postal->Stop();
    evaluation->Stop();
    plugin->UnregisterQml();
    plugin.reset();
    gui->Stop();
  }

  const TemporaryFolder folder;
  const std::shared_ptr<Store::VStore> store = NMX::MakeShared<Store::VStore>();
  const std::shared_ptr<Postal::VAsioPostalService> postal = NMX::MakeShared<Postal::VAsioPostalService>();
  const std::shared_ptr<Postal::VGuiPostalService> gui = std::make_shared<Postal::VGuiPostalService>();
  const std::shared_ptr<Locations> locations = std::make_shared<Locations>(folder.Path());
  const std::shared_ptr<SmartObjects::DeviceLayouts> layouts = std::make_shared<SmartObjects::DeviceLayouts>();
  const std::shared_ptr<SmartObjects::VSmartObjectControls> smartObjects =
      std::make_shared<SmartObjects::VSmartObjectControls>(store, layouts);
  const std::shared_ptr<Evaluation::VObjectEvaluationEngine> evaluation =
      NMX::MakeShared<Evaluation::VObjectEvaluationEngine>(store);
  const std::shared_ptr<Characters::VCharacterControls> characters =
      std::make_shared<Characters::VCharacterControls>(store, postal, std::chrono::milliseconds(300));
  const std::shared_ptr<Calibration::VCalibrationProvider> calibration =
      std::make_shared<Calibration::VCalibrationProvider>(store, postal, Calibration::CalibrationTimes{});
  const std::shared_ptr<Simulation::VDeviceServices> devices =
      std::make_shared<Simulation::VDeviceServices>(store, postal, std::chrono::milliseconds(300));
  const std::shared_ptr<FileIO::VRunaCoreFileIO> fileIO = std::make_shared<FileIO::VRunaCoreFileIO>(store);
  const std::shared_ptr<const void> patterns = SmartObjects::ManagePatterns(store, smartObjects, gui);
  const std::shared_ptr<Panel::VSelectionManager> selection = std::make_shared<Panel::VSelectionManager>();
  OneCommand userInterface;
  PluginPointer plugin = LoadPlugin(SUBJECT_STORE_PLUGIN_FILE);
  std::optional<VPluginHost> host;

  /// One edit of the subject of that name: `step(editor, id)`. False when there is none or the store refuses.
  template <class Step>
  bool Edit(const QString& name, Step step)
  {
    const auto editor = store->Editor();
    TSubjectStoreId id;
    return editor->FindByName(Text(name), id).Succeeded() && step(*editor, id).Succeeded() &&
           editor->Commit().Succeeded();
  }

  template <class T>
  std::optional<T> Read(const QString& name, NMX::EntryPath path) const
  {
    const auto access = store->Reader();
    TSubjectStoreId id;
    const NMX::Value* value = nullptr;
    if (access->FindByName(Text(name), id).Failed() || access->Find(id, path, value).Failed() || value == nullptr)
      return std::nullopt;
    const T* typed = std::get_if<T>(value);
    return typed != nullptr ? std::optional<T>(*typed) : std::nullopt;
  }
};

Stage::Stage(QQmlEngine& engine) : m_engine(engine), m_services(std::make_unique<Services>(*this)) {}

Stage::~Stage() = default;

void Stage::clear()
{
  const auto editor = m_services->store->Editor();
  for (const NMX::ESubjectKind kind : NMX::allSubjectKinds)
  {
    std::vector<TSubjectStoreId> ids;
    (void)editor->Subjects(kind, ids);
    for (const TSubjectStoreId id : ids)
      (void)editor->Remove(id);
  }
  for (const char* root : {"Application/Devices", "Application/ObjectPresets"})
    for (const NMX::EntryPath& path : editor->ApplicationEntries(NMX::EntryPath(root)))
      (void)editor->SetApplicationEntry(path, {});
  (void)editor->Commit();
}

bool Stage::add(const QString& kind, const QString& name)
{
  const auto editor = m_services->store->Editor();
  const auto known = NMX::KindFromKey(Text(kind));
  TSubjectStoreId id;
  return known && editor->Add(*known, Text(name), id).Succeeded() && editor->Commit().Succeeded();
}

bool Stage::remove(const QString& name)
{
  return m_services->Edit(name, [](NMX::IEntryEditor& editor, TSubjectStoreId id) { return editor.Remove(id); });
}

bool Stage::rename(const QString& name, const QString& newName)
{
  return m_services->Edit(name, [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                          { return editor.Rename(id, Text(newName), NMX::ENotify::Yes); });
}

bool Stage::set(const QString& name, const QString& path, const QVariant& value)
{
  const NMX::EntryPath entry(Text(path));
  return m_services->Edit(name,
                          [&](NMX::IEntryEditor& editor, TSubjectStoreId id) -> NMX::IResult
                          {
                            if (entry == Paths::ParentSubjectId())
                            {
                              TSubjectStoreId parent;
                              (void)editor.FindByName(Text(value.toString()), parent);
                              return editor.SetValue(id, entry, parent);
                            }
                            if (value.typeId() == QMetaType::Bool)
                              return editor.SetValue(id, entry, value.toBool(), NMX::ENotify::Yes);
                            if (value.typeId() == QMetaType::Int || value.typeId() == QMetaType::Double)
                              return editor.SetValue(id, entry, value.toInt());
                            return editor.SetValue(id, entry, Text(value.toString()), NMX::ENotify::Yes);
                          });
}

bool Stage::setMarkers(const QString& name, const QVariantList& places)
{
  std::vector<NMX::Position> markers;
  for (const QVariant& place : places)
  {
    const QVariantList xyz = place.toList();
    markers.push_back({xyz.value(0).toDouble(), xyz.value(1).toDouble(), xyz.value(2).toDouble()});
  }
  return m_services->Edit(name, [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                          { return editor.SetValue(id, Paths::Markers(), markers); });
}

bool Stage::setClusters(const QString& name, const QVariantList& clusters)
{
  std::vector<NMX::SmartCluster> made;
  for (const QVariant& cluster : clusters)
  {
    const QVariantMap map = cluster.toMap();
    made.push_back({Text(map["label"].toString()), Text(map["device"].toString()), map["pattern"].toUInt(),
                    Text(map.value("type", "Corvex1").toString())});
  }
  return m_services->Edit(name, [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                          { return editor.SetValue(id, Paths::SmartClusters(), made, NMX::ENotify::Yes); });
}

bool Stage::setSlots(const QString& name, const QStringList& slotNames)
{
  std::vector<NMX::Slot> made;
  for (const QString& slot : slotNames)
    made.push_back({TSubjectStoreId(made.size() + 1), Text(slot)});
  return m_services->Edit(name, [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                          { return editor.SetValue(id, Paths::Slots(), made); });
}

void Stage::addDevice(const QString& urn)
{
  Simulation::Devices devices(m_services->store);
  (void)devices.Add(Text(urn), "Corvex1");
}

bool Stage::addPreset(int id, const QString& name, const QString& colour)
{
  const auto editor = m_services->store->Editor();
  const std::string root = "Application/ObjectPresets/" + std::to_string(id);
  NMX::Colour value;
  return NMX::ColourFromText(Text(colour), value).Succeeded() &&
         editor->SetApplicationEntry(NMX::EntryPath(root + "/Name"), Text(name)).Succeeded() &&
         editor->SetApplicationEntry(NMX::EntryPath(root + "/ReadOnly"), false).Succeeded() &&
         editor->SetApplicationEntry(NMX::EntryPath(root + "/Parameters/ColourRGBA"), value).Succeeded() &&
         editor->Commit().Succeeded();
}

bool Stage::has(const QString& name) const
{
  TSubjectStoreId id;
  return m_services->store->Reader()->FindByName(Text(name), id).Succeeded();
}

QStringList Stage::names(const QString& kind) const
{
  QStringList names;
  const auto known = NMX::KindFromKey(Text(kind));
  if (!known)
    return names;
  std::vector<TSubjectStoreId> ids;
  const auto access = m_services->store->Reader();
  (void)access->Subjects(*known, ids);
  for (const TSubjectStoreId id : ids)
    if (std::string name; NMX::Read(*access, id, Paths::Name(), name).Succeeded())
      names.append(QString::fromStdString(name));
  return names;
}

QVariant Stage::entry(const QString& name, const QString& path) const
{
  const NMX::EntryPath entry(Text(path));
  if (const auto value = m_services->Read<bool>(name, entry))
    return *value;
  if (const auto value = m_services->Read<std::int32_t>(name, entry))
    return *value;
  if (const auto value = m_services->Read<std::uint32_t>(name, entry))
    return *value;
  if (const auto value = m_services->Read<std::string>(name, entry))
    return QString::fromStdString(*value);
  if (const auto value = m_services->Read<NMX::Colour>(name, entry))
    return QString::fromStdString(NMX::ColourToText(*value));
  if (const auto value = m_services->Read<TSubjectStoreId>(name, entry))
  {
    std::string parent;
    const auto access = m_services->store->Reader();
    if (value->Valid())
      (void)NMX::Read(*access, *value, Paths::Name(), parent);
    return QString::fromStdString(parent);
  }
  return {};
}

QStringList Stage::clusters(const QString& name) const
{
  QStringList texts;
  const auto found = m_services->Read<std::vector<NMX::SmartCluster>>(name, Paths::SmartClusters());
  for (const NMX::SmartCluster& cluster : found.value_or(std::vector<NMX::SmartCluster>{}))
    texts.append(
        QString::fromStdString(cluster.label + ' ' + cluster.deviceUrn + ' ' + std::to_string(cluster.pattern)));
  return texts;
}

QVariant Stage::setting(const QString& key) const
{
  const auto access = m_services->store->Reader();
  const NMX::Value* value =
      access->FindApplicationEntry(NMX::EntryPath("Application/Settings/SubjectStore/" + Text(key)));
  if (value == nullptr)
    return {};
  if (const auto* text = std::get_if<std::string>(value))
    return QString::fromStdString(*text);
  if (const auto* truth = std::get_if<bool>(value))
    return *truth;
  if (const auto* number = std::get_if<double>(value))
    return *number;
  if (const auto* option = std::get_if<NMX::Option>(value))
    return QString::fromStdWString(option->chosen);
  return {};
}

QString Stage::folder() const
{
  return QString::fromStdString(m_services->folder.Path().string());
}

bool Stage::fileExists(const QString& name) const
{
  return QFile::exists(folder() + '/' + name);
}

void Stage::writeFile(const QString& name, const QString& text) const
{
  std::ofstream(m_services->folder.Path() / Text(name)) << Text(text);
}

QString Stage::commandProblem() const
{
  std::string reason;
  (void)m_services->userInterface.command.possible(reason);
  return QString::fromStdString(reason);
}

bool Stage::triggerCommand()
{
  std::string reason;
  return m_services->userInterface.command.trigger(reason).Succeeded();
}

QString Stage::slotOf(const QString& name) const
{
  const auto slot = m_services->Read<TSubjectStoreId>(name, Paths::ParentSubjectSlotId());
  const QString parent = entry(name, "ParentSubjectId").toString();
  const auto known = m_services->Read<std::vector<NMX::Slot>>(parent, Paths::Slots());
  for (const NMX::Slot& one : known.value_or(std::vector<NMX::Slot>{}))
    if (slot == one.id)
      return QString::fromStdString(one.name);
  return {};
}

QVariantList Stage::markers(const QString& name) const
{
  QVariantList places;
  const auto found = m_services->Read<std::vector<NMX::Position>>(name, Paths::Markers());
  for (const NMX::Position& marker : found.value_or(std::vector<NMX::Position>{}))
    places.append(QVariant(QVariantList{marker.x, marker.y, marker.z}));
  return places;
}

QString Stage::applicationEntry(const QString& path) const
{
  const auto access = m_services->store->Reader();
  const NMX::Value* value = access->FindApplicationEntry(NMX::EntryPath(Text(path)));
  if (value == nullptr)
    return {};
  if (const auto* colour = std::get_if<NMX::Colour>(value))
    return QString::fromStdString(NMX::ColourToText(*colour));
  if (const bool* truth = std::get_if<bool>(value))
    return *truth ? "true" : "false";
  const auto* text = std::get_if<std::string>(value);
  return text != nullptr ? QString::fromStdString(*text) : QString();
}

bool Stage::setApplicationEntry(const QString& path, const QVariant& value)
{
  NMX::Value made;
  if (value.typeId() == QMetaType::Bool)
    made = value.toBool();
  else if (value.typeId() == QMetaType::Int || value.typeId() == QMetaType::Double)
    made = value.toDouble();
  else if (value.isValid())
    made = Text(value.toString());
  const auto editor = m_services->store->Editor();
  return editor->SetApplicationEntry(NMX::EntryPath(Text(path)), std::move(made)).Succeeded() &&
         editor->Commit().Succeeded();
}
