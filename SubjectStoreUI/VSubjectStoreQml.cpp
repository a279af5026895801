#include "SubjectStoreUI/VSubjectStoreQml.h"

#include "HostInterface/RunaCorePluginInterface/IObjectEvaluationSettings.h"
#include "HostInterface/RunaCorePluginInterface/IPluginSettings.h"
#include "StoreInterface/EntryPaths.h"
#include "SubjectStoreUI/ObjectEvaluationWatch.h"
#include "SubjectStoreUI/PanelBackend.h"
#include "SubjectStoreUI/PanelParameters.h"
#include "SubjectStoreUI/SubjectSection.h"
#include "SubjectStoreUI/VCalibrationScalingQml.h"
#include "SubjectStoreUI/VStoreObjectPresetModel.h"
#include "SubjectStoreUI/VSubjectListModelStore.h"
#include "SubjectStoreUI/VSubjectModelInternalData.h"
#include "SubjectStoreUI/VSubjectPanelQml.h"

#include <QQmlContext>
#include <QQmlEngine>

#include <algorithm>
#include <utility>

namespace SubjectStoreUI
{

using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using NMX::TSubjectStoreId;
using RunaCorePluginInterface::IPanelServices;
namespace Feature = RunaCorePluginInterface::Feature;
namespace Paths = NMX::Paths;

namespace
{

using Clusters = std::vector<NMX::SmartCluster>;

/// How long changes are gathered before the models show them: what a client changes is seen within a tenth of a second.
constexpr int batchingIntervalInMilliseconds = 50;

/// The kinds that have sections, each with the features of which one must be on, in the order of the sections.
constexpr std::pair<ESubjectKind, std::uint32_t> sectionFeatures[] = {
    {ESubjectKind::CharactersFromClusters, Feature::characters},
    {ESubjectKind::GeneralSubjects, Feature::generalSubjects},
    {ESubjectKind::SmartObjects, Feature::smartObjects},
    {ESubjectKind::BasicObjects, Feature::basicObjects},
    {ESubjectKind::LabellingClusters, Feature::labellingClusters},
    {ESubjectKind::Markerless, Feature::markerless},
    {ESubjectKind::Props, Feature::props},
    {ESubjectKind::SceneMeshes, Feature::sceneMeshes},
};

}

struct VSubjectStoreQml::Implementation
{
  Implementation(VSubjectStoreQml& owner, PanelBackend panelBackend)
      : backend(std::move(panelBackend)), data(std::make_shared<VSubjectModelInternalData>(backend.store, backend.gui)),
        allSubjects(NMX::MakeShared<VSubjectListModelStore>(data, &warnings)), evaluation(backend),
        setup(backend.store, backend.gui, SetupParameters()), selected(backend.store, backend.gui, SubjectParameters())
  {
    allSubjects->followStore(batchingIntervalInMilliseconds);
    QObject::connect(&warnings, &VSubjectWarningSummary::subjectWarningsChanged, &owner,
                     &VSubjectStoreQml::subjectWarningsChanged);
    QObject::connect(&evaluation, &ObjectEvaluationWatch::changed, &owner,
                     &VSubjectStoreQml::objectEvaluationProgressChanged);
    for (const auto& [kind, features] : sectionFeatures)
      if ((Features() & features) != 0)
        sections.push_back(std::make_unique<SubjectSection>(data, kind, batchingIntervalInMilliseconds));
    if ((Features() & Feature::objectPresets) != 0)
      presets =
          NMX::MakeShared<VStoreObjectPresetModel>(backend.store, backend.gui, [this] { return FirstSelected(); });
    selected.ShowSubject(FirstSelected());
    if (backend.selection)
      selectionChanges = backend.selection->OnChange([this] { selected.ShowSubject(FirstSelected()); });
  }

  [[nodiscard]] std::uint32_t Features() const
  {
    const auto features = backend.Get(&IPanelServices::Features);
    return features ? features->Mask() : 0;
  }

  [[nodiscard]] TSubjectStoreId FirstSelected() const
  {
    const auto subjects = backend.SelectedSubjects();
    return subjects.empty() ? TSubjectStoreId{} : subjects.front();
  }

  [[nodiscard]] VResultGadget SetModelOutput(const QString& name, bool on)
  {
    const NMX::EntryPath path = name == "CGM2" ? Paths::ModelOutputCGM2() : Paths::ModelOutputPluginKinex();
    if (name != "CGM2" && name != "PluginKinex")
      return {EResult::NotFound, "There is no model \"" + name.toStdString() + "\"."};
    return backend.EditEach(backend.SelectedSubjects(), [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                            { return editor.SetValue(id, path, on); });
  }

  const PanelBackend backend;
  const std::shared_ptr<VSubjectModelInternalData> data;
  VSubjectWarningSummary warnings;
  const std::shared_ptr<VSubjectListModelStore> allSubjects;
  ObjectEvaluationWatch evaluation;
  std::vector<std::unique_ptr<SubjectSection>> sections;
  StoreUI::VStoreParameterModel setup;
  StoreUI::VStoreParameterModel selected;
  std::shared_ptr<VStoreObjectPresetModel> presets;
  std::unique_ptr<VSubjectPanelQml> panel;
  NMX::Subscription selectionChanges;
};

VSubjectStoreQml::VSubjectStoreQml(QQmlContext* rootContext, std::shared_ptr<ISelectionManager> selection,
                                   std::shared_ptr<IPanelServices> panelServices,
                                   std::shared_ptr<NMX::IPostalService> gui, std::shared_ptr<NMX::IStore> store)
    : m_implementation(std::make_unique<Implementation>(
          *this, PanelBackend{std::move(store), std::move(gui), std::move(selection), std::move(panelServices)}))
{
  QObjectList sections;
  for (const auto& section : m_implementation->sections)
    sections.append(&section->Model());
  m_implementation->panel = std::make_unique<VSubjectPanelQml>(m_implementation->backend, sections);
  connect(m_implementation->panel.get(), &VSubjectPanelQml::subjectAdded, this, &VSubjectStoreQml::focusSubject);
  if (rootContext == nullptr)
    return;
  rootContext->setContextProperty("rootContextSubjectStore", this);
  rootContext->setContextProperty("rootContextSubjectPanel", m_implementation->panel.get());
}

VSubjectStoreQml::~VSubjectStoreQml() = default;

void VSubjectStoreQml::SetObjectPresetProvider(std::shared_ptr<RunaCorePluginInterface::IObjectPresetProvider> provider)
{
  m_implementation->panel->SetObjectPresetProvider(std::move(provider));
}

QVariantList VSubjectStoreQml::subjectWarnings() const
{
  return m_implementation->warnings.subjectWarnings();
}

double VSubjectStoreQml::objectEvaluationProgressDone() const
{
  return m_implementation->evaluation.Progress().first;
}

double VSubjectStoreQml::objectEvaluationProgressRequired() const
{
  return m_implementation->evaluation.Progress().second;
}

QObjectList VSubjectStoreQml::subjectTypeModels() const
{
  QObjectList models;
  for (const auto& section : m_implementation->sections)
  {
    QQmlEngine::setObjectOwnership(&section->Model(), QQmlEngine::CppOwnership);
    models.append(&section->Model());
  }
  return models;
}

QAbstractItemModel* VSubjectStoreQml::subjectSetupParameterModel() const
{
  return &m_implementation->setup;
}

QAbstractItemModel* VSubjectStoreQml::selectedSubjectParameterModel() const
{
  return &m_implementation->selected;
}

QAbstractItemModel* VSubjectStoreQml::objectPresetModel() const
{
  return m_implementation->presets.get();
}

uint VSubjectStoreQml::enabledFeatures() const
{
  return m_implementation->Features();
}

QVariantList VSubjectStoreQml::subjectStoreIdsBySelectionItems(const QVariantList& i_SubjectSelectionItems) const
{
  const auto access = m_implementation->backend.store->Reader();
  std::vector<TSubjectStoreId> subjects = SubjectsOf(ToItems(i_SubjectSelectionItems));
  std::erase_if(subjects,
                [&](TSubjectStoreId id)
                {
                  ESubjectKind kind{};
                  return access->Kind(id, kind).Failed();
                });
  return FromIds(subjects);
}

QVariantList VSubjectStoreQml::subjects() const
{
  return FromIds(m_implementation->data->Subjects(*m_implementation->backend.store->Reader(), {}));
}

QString VSubjectStoreQml::subjectNameRegex() const
{
  return QString::fromStdString(m_implementation->backend.store->Reader()->NamePattern());
}

bool VSubjectStoreQml::isSubjectNameInUse(const QString& i_SubjectName) const
{
  TSubjectStoreId id;
  return m_implementation->backend.store->Reader()->FindByName(i_SubjectName.toStdString(), id).Succeeded();
}

QString VSubjectStoreQml::subjectName(const VStoreIdGadget& i_SubjectStoreId) const
{
  return m_implementation->backend.Name(i_SubjectStoreId.Id());
}

VResultGadget VSubjectStoreQml::setSubjectName(const VStoreIdGadget& i_SubjectStoreId, const QString& i_Name)
{
  const VResultGadget renamed = m_implementation->backend.Edit(
      [&](NMX::IEntryEditor& editor)
      { return editor.Rename(i_SubjectStoreId.Id(), i_Name.toStdString(), NMX::ENotify::Yes); });
  if (renamed.Result() != EResult::InvalidName && renamed.Result() != EResult::AlreadyPresent)
    return renamed;
  return {renamed.Result(), m_implementation->panel->nameProblem(i_Name, i_SubjectStoreId).toStdString()};
}

uint VSubjectStoreQml::subjectFlags(const VStoreIdGadget& i_SubjectStoreId) const
{
  return m_implementation->backend.Entry<std::uint32_t>(i_SubjectStoreId.Id(), Paths::Flags()).value_or(0);
}

int VSubjectStoreQml::subjectCalibration(const VStoreIdGadget& i_SubjectStoreId) const
{
  return m_implementation->backend.Entry<std::int32_t>(i_SubjectStoreId.Id(), Paths::Calibration()).value_or(0);
}

bool VSubjectStoreQml::subjectEnabled(const VStoreIdGadget& i_SubjectStoreId) const
{
  return m_implementation->backend.Entry<bool>(i_SubjectStoreId.Id(), Paths::Enabled()).value_or(false);
}

VResultGadget VSubjectStoreQml::setSubjectsEnabled(const QVariantList& i_SubjectStoreIds, bool i_bEnabled)
{
  return m_implementation->backend.EditEach(ToIds(i_SubjectStoreIds), [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                                            { return editor.SetValue(id, Paths::Enabled(), i_bEnabled); });
}

VResultGadget VSubjectStoreQml::toggleSubjectsEnabled(const QVariantList& i_SubjectStoreIds)
{
  return m_implementation->backend.EditEach(ToIds(i_SubjectStoreIds),
                                            [](NMX::IEntryEditor& editor, TSubjectStoreId id)
                                            {
                                              bool enabled = false;
                                              const IResult read = NMX::Read(editor, id, Paths::Enabled(), enabled);
                                              return read.Failed() ? read
                                                                   : editor.SetValue(id, Paths::Enabled(), !enabled);
                                            });
}

VResultGadget VSubjectStoreQml::rebootSubjects(const QVariantList& i_SubjectStoreIds)
{
  QStringList urns;
  for (const TSubjectStoreId id : ToIds(i_SubjectStoreIds))
  {
    const auto clusters = m_implementation->backend.Entry<Clusters>(id, Paths::SmartClusters()).value_or(Clusters{});
    for (const NMX::SmartCluster& cluster : clusters)
      if (!cluster.deviceUrn.empty())
        urns.append(QString::fromStdString(cluster.deviceUrn));
  }
  if (urns.isEmpty())
    return {EResult::InvalidArgument, "No device is linked to what is selected."};
  return m_implementation->panel->rebootDevices(urns);
}

VResultGadget VSubjectStoreQml::removeSubjects(const QVariantList& i_SubjectStoreIds, bool i_bRemoveChildren)
{
  return m_implementation->backend.Edit(
      [&](NMX::IEntryEditor& editor) -> IResult
      {
        std::vector<TSubjectStoreId> leaving;
        for (const TSubjectStoreId id : ToIds(i_SubjectStoreIds))
        {
          std::vector<TSubjectStoreId> beneath{id};
          if (i_bRemoveChildren)
            if (const IResult listed = editor.Descendants(id, beneath); listed.Failed())
              return listed;
          leaving.insert(leaving.end(), beneath.begin(), beneath.end());
        }
        std::sort(leaving.begin(), leaving.end());
        leaving.erase(std::unique(leaving.begin(), leaving.end()), leaving.end());
        for (const TSubjectStoreId id : leaving)
          if (const IResult removed = editor.Remove(id); removed.Failed())
            return removed;
        return leaving.empty() ? EResult::InvalidArgument : EResult::Ok;
      });
}

int VSubjectStoreQml::smartClusterCount(const VStoreIdGadget& i_SubjectStoreId) const
{
  const auto clusters = m_implementation->backend.Entry<Clusters>(i_SubjectStoreId.Id(), Paths::SmartClusters());
  return clusters ? static_cast<int>(clusters->size()) : 0;
}

QString VSubjectStoreQml::smartClusterLabel(const VStoreIdGadget& i_SubjectStoreId, int i_SmartClusterIndex) const
{
  const auto clusters = m_implementation->backend.Entry<Clusters>(i_SubjectStoreId.Id(), Paths::SmartClusters());
  const auto index = static_cast<std::size_t>(i_SmartClusterIndex); // of a negative index far past the end
  return clusters && index < clusters->size() ? QString::fromStdString((*clusters)[index].label) : QString();
}

VResultGadget VSubjectStoreQml::addModel(const QString& i_ModelName)
{
  return m_implementation->SetModelOutput(i_ModelName, true);
}

VResultGadget VSubjectStoreQml::removeModel(const QString& i_ModelName)
{
  return m_implementation->SetModelOutput(i_ModelName, false);
}

VCalibrationScalingQml* VSubjectStoreQml::createCalibrationScalingOperation()
{
  auto operation = VCalibrationScalingQml::Make(m_implementation->backend, m_implementation->FirstSelected());
  if (!operation)
    return nullptr;
  operation->setParent(this);
  QQmlEngine::setObjectOwnership(operation.get(), QQmlEngine::CppOwnership);
  return operation.release();
}

const PanelBackend& VSubjectStoreQml::Backend() const
{
  return m_implementation->backend;
}

}
