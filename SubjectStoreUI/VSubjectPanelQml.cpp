#include "SubjectStoreUI/VSubjectPanelQml.h"

#include "HostInterface/ICharacterControls.h"
#include "HostInterface/IDeviceServices.h"
#include "HostInterface/ISmartObjectControls.h"
#include "HostInterface/RunaCorePluginInterface/ICalibrationProvider.h"
#include "HostInterface/RunaCorePluginInterface/IObjectPresetProvider.h"
#include "RunaCorePluginSubjectStore/Subjects/NewCharacter.h"
#include "StoreInterface/ColourText.h"
#include "StoreInterface/EntryPaths.h"
#include "SubjectStoreUI/PanelBackend.h"
#include "SubjectStoreUI/PanelQuestions.h"
#include "SubjectStoreUI/StoreWatch.h"
#include "SubjectStoreUI/VDeviceModel.h"
#include "SubjectStoreUI/VPanelRowsModel.h"

#include <utility>
#include <vector>

namespace SubjectStoreUI
{

using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using NMX::TSubjectStoreId;
using RunaCorePluginInterface::IPanelServices;
namespace Paths = NMX::Paths;

namespace
{

constexpr int watchIntervalInMilliseconds = 50;

using Clusters = std::vector<NMX::SmartCluster>;

QList<VSortSubjectsProxyModel*> ToSections(const QObjectList& objects)
{
  QList<VSortSubjectsProxyModel*> sections;
  for (QObject* object : objects)
    if (auto* section = qobject_cast<VSortSubjectsProxyModel*>(object))
      sections.append(section);
  return sections;
}

}

struct VSubjectPanelQml::Implementation
{
  Implementation(const PanelBackend& panelBackend, const QObjectList& sections)
      : backend(panelBackend), watch(*backend.store, backend.gui, watchIntervalInMilliseconds),
        rows(ToSections(sections)), devices(backend, watch)
  {
    std::shared_ptr<RunaCorePluginInterface::ICalibrationProvider> provider;
    if (provider = backend.Get(&IPanelServices::CalibrationProvider); provider)
      calibration = std::make_unique<VSubjectCalibrationQml>(backend, *provider);
    if (backend.Get(&IPanelServices::ObjectEvaluationSettings))
      evaluation = std::make_unique<VObjectEvaluationQml>(backend);
  }

  [[nodiscard]] VResultGadget SetText(const QVariantList& subjects, NMX::EntryPath path, const QString& text) const
  {
    return backend.EditEach(ToIds(subjects), [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                            { return editor.SetValue(id, path, text.toStdString(), NMX::ENotify::Yes); });
  }

  /// Edits one cluster: `edit(editor, cluster)`. `InvalidIndex` when it is not there.
  template <class Edit>
  [[nodiscard]] VResultGadget EditCluster(TSubjectStoreId object, int index, Edit edit) const
  {
    return backend.Edit(
        [&](NMX::IEntryEditor& editor) -> IResult
        {
          Clusters clusters;
          if (const IResult read = NMX::Read(editor, object, Paths::SmartClusters(), clusters); read.Failed())
            return read;
          const auto position = static_cast<std::size_t>(index); // of a negative index far past the end
          if (position >= clusters.size())
            return EResult::InvalidIndex;
          if (const IResult edited = edit(editor, clusters[position]); edited.Failed())
            return edited;
          return editor.SetValue(object, Paths::SmartClusters(), std::move(clusters), NMX::ENotify::Yes);
        });
  }

  void ReadSelection()
  {
    const auto items = backend.selection ? backend.selection->Selection() : std::vector<SelectionItem>{};
    selection = FromItems(items);
    selectedSubjects = FromIds(SubjectsOf(items));
  }

  /// The selection keeps subjects and devices that have gone; no command could do anything with them.
  void DeselectRemoved() const
  {
    if (!backend.selection)
      return;
    std::vector<SelectionItem> items = backend.selection->Selection();
    const auto dropGone = [this, &items](const NMX::IStoreReader& access)
    {
      return std::erase_if(items,
                           [this, &access](const SelectionItem& item)
                           {
                             ESubjectKind kind{};
                             if (!item.device.empty())
                               return !devices.Has(item.device);
                             return item.subject.Valid() && access.Kind(item.subject, kind).Failed();
                           });
    };
    if (dropGone(*backend.store->Reader()) > 0)
      backend.selection->Select(std::move(items));
  }

  const PanelBackend& backend;
  // QML reads a list as a whole for each of its elements: that must cost nothing.
  QVariantList selection;
  QVariantList selectedSubjects;
  StoreWatch watch;
  VPanelRowsModel rows;
  VDeviceModel devices;
  std::unique_ptr<VSubjectCalibrationQml> calibration;
  std::unique_ptr<VObjectEvaluationQml> evaluation;
  std::shared_ptr<RunaCorePluginInterface::IObjectPresetProvider> presetProvider;
  NMX::Subscription selectionChanges;
};

VSubjectPanelQml::VSubjectPanelQml(const PanelBackend& backend, const QObjectList& sections)
    : m_implementation(std::make_unique<Implementation>(backend, sections))
{
  m_implementation->ReadSelection();
  connect(&m_implementation->watch, &StoreWatch::changed, this,
          [this]
          {
            m_implementation->DeselectRemoved();
            Q_EMIT revisionChanged();
          });
  if (backend.selection)
    m_implementation->selectionChanges = backend.selection->OnChange(
        [this]
        {
          m_implementation->ReadSelection();
          Q_EMIT selectionChanged();
        });
}

VSubjectPanelQml::~VSubjectPanelQml() = default;

void VSubjectPanelQml::SetObjectPresetProvider(std::shared_ptr<RunaCorePluginInterface::IObjectPresetProvider> provider)
{
  m_implementation->presetProvider = std::move(provider);
}

QVariantList VSubjectPanelQml::selection() const
{
  return m_implementation->selection;
}

QVariantList VSubjectPanelQml::selectedSubjects() const
{
  return m_implementation->selectedSubjects;
}

QAbstractItemModel* VSubjectPanelQml::rows() const
{
  return &m_implementation->rows;
}

QAbstractItemModel* VSubjectPanelQml::devices() const
{
  return &m_implementation->devices;
}

VSubjectCalibrationQml* VSubjectPanelQml::calibration() const
{
  return m_implementation->calibration.get();
}

VObjectEvaluationQml* VSubjectPanelQml::evaluation() const
{
  return m_implementation->evaluation.get();
}

int VSubjectPanelQml::revision() const
{
  return m_implementation->watch.Revision();
}

bool VSubjectPanelQml::autoPatternManagement() const
{
  const auto access = m_implementation->backend.store->Reader();
  const NMX::Value* value = access->FindApplicationEntry(Paths::AutoPatternManagement());
  const bool* on = value != nullptr ? std::get_if<bool>(value) : nullptr;
  return on != nullptr && *on;
}

void VSubjectPanelQml::select(const QVariantList& items)
{
  if (m_implementation->backend.selection)
    m_implementation->backend.selection->Select(ToItems(items));
}

VSelectionItemGadget VSubjectPanelQml::itemOf(const VStoreIdGadget& subject) const
{
  return VSelectionItemGadget(subject.Id());
}

VSelectionItemGadget VSubjectPanelQml::itemOfDevice(const QString& urn) const
{
  return VSelectionItemGadget(SelectionItem{{}, -1, urn.toStdString()});
}

QString VSubjectPanelQml::nameProblem(const QString& name, const VStoreIdGadget& subject) const
{
  return PanelQuestions::NameProblem(m_implementation->backend, name, subject.Id());
}

QString VSubjectPanelQml::colour(const VStoreIdGadget& subject) const
{
  const auto colour = m_implementation->backend.Entry<NMX::Colour>(subject.Id(), Paths::ColourRGBA());
  return colour ? QString::fromStdString(NMX::ColourToText(*colour)) : QString();
}

VResultGadget VSubjectPanelQml::setColour(const QVariantList& subjects, const QString& colour)
{
  NMX::Colour value;
  if (NMX::ColourFromText(colour.toStdString(), value).Failed())
    return {EResult::InvalidValue, "\"" + colour.toStdString() + "\" is not a colour."};
  return m_implementation->backend.EditEach(ToIds(subjects), [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                                            { return editor.SetValue(id, Paths::ColourRGBA(), value); });
}

QString VSubjectPanelQml::proximityGroup(const VStoreIdGadget& subject) const
{
  return QString::fromStdString(
      m_implementation->backend.Entry<std::string>(subject.Id(), Paths::ProximityGroupName()).value_or(""));
}

VResultGadget VSubjectPanelQml::setProximityGroup(const QVariantList& subjects, const QString& name)
{
  return m_implementation->SetText(subjects, Paths::ProximityGroupName(), name);
}

QString VSubjectPanelQml::templateGroup(const VStoreIdGadget& subject) const
{
  return QString::fromStdString(
      m_implementation->backend.Entry<std::string>(subject.Id(), Paths::TemplateGroupName()).value_or(""));
}

VResultGadget VSubjectPanelQml::setTemplateGroup(const QVariantList& subjects, const QString& name)
{
  return m_implementation->SetText(subjects, Paths::TemplateGroupName(), name);
}

QStringList VSubjectPanelQml::proximityGroups() const
{
  return PanelQuestions::Texts(m_implementation->backend, Paths::ProximityGroupName());
}

QStringList VSubjectPanelQml::templateGroups() const
{
  return PanelQuestions::Texts(m_implementation->backend, Paths::TemplateGroupName());
}

VResultGadget VSubjectPanelQml::setAutoAssign(const QVariantList& subjects, bool on)
{
  return m_implementation->backend.EditEach(ToIds(subjects), [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                                            { return editor.SetValue(id, Paths::AutoAssignEnabled(), on); });
}

VResultGadget VSubjectPanelQml::applyPreset(const VStoreIdGadget& preset, const QVariantList& subjects)
{
  const auto& provider = m_implementation->presetProvider;
  if (!provider)
    return IResult(EResult::NotAvailable);
  return m_implementation->backend.EditEach(ToIds(subjects), [&](NMX::IEntryEditor& editor, TSubjectStoreId id)
                                            { return provider->Apply(editor, preset.Id(), id); });
}

VResultGadget VSubjectPanelQml::addBasicObject(const QString& name)
{
  TSubjectStoreId added;
  const VResultGadget result = m_implementation->backend.Edit(
      [&](NMX::IEntryEditor& editor) { return editor.Add(ESubjectKind::BasicObjects, name.toStdString(), added); });
  if (!result.Failed())
    Q_EMIT subjectAdded(VStoreIdGadget(added));
  return result;
}

VResultGadget VSubjectPanelQml::addSmartObject(const QString& name, const QUrl& file)
{
  const auto controls = m_implementation->backend.Get(&IPanelServices::SmartObjectControls);
  if (!controls)
    return IResult(EResult::NotAvailable);
  if (!file.isLocalFile())
    return {EResult::InvalidName, "A template has to be chosen."};
  const IResult created = controls->CreateFromTemplate(name.toStdString(), file.toLocalFile().toStdString(),
                                                       ISmartObjectControls::ECreate::Yes);
  if (created == EResult::Failed)
    return {created, "The template cannot be used; the log says where and why."};
  TSubjectStoreId added;
  if (created.Succeeded() &&
      m_implementation->backend.store->Reader()->FindByName(name.toStdString(), added).Succeeded())
    Q_EMIT subjectAdded(VStoreIdGadget(added));
  return created;
}

VResultGadget VSubjectPanelQml::addCharacter(const QString& name, const QUrl& file)
{
  const auto controls = m_implementation->backend.Get(&IPanelServices::CharacterControls);
  if (!controls)
    return IResult(EResult::NotAvailable);
  if (!file.isLocalFile())
    return {EResult::InvalidName, "A template has to be chosen."};
  TSubjectStoreId added;
  const VResultGadget result = Subjects::Guarded(
      [&]
      {
        return Subjects::CreateCharacter(*m_implementation->backend.store, *controls, name.toStdString(),
                                         file.toLocalFile().toStdString(), added);
      });
  if (!result.Failed())
    Q_EMIT subjectAdded(VStoreIdGadget(added));
  return result;
}

VResultGadget VSubjectPanelQml::setClusterPattern(const VStoreIdGadget& subject, int cluster, int pattern)
{
  const auto controls = m_implementation->backend.Get(&IPanelServices::SmartObjectControls);
  if (!controls)
    return IResult(EResult::NotAvailable);
  const VResultGadget set =
      m_implementation->EditCluster(subject.Id(), cluster,
                                    [&](const NMX::IEntryEditor& editor, NMX::SmartCluster& edited)
                                    {
                                      edited.pattern =
                                          static_cast<std::uint32_t>(pattern); // a negative one is far too great
                                      return controls->CheckPattern(editor, edited.type, edited.pattern);
                                    });
  if (set.Result() == EResult::InvalidValue)
    return {EResult::InvalidValue, "Pattern " + std::to_string(pattern) + " is not in use at present."};
  return set;
}

VResultGadget VSubjectPanelQml::setClusterDevice(const VStoreIdGadget& subject, int cluster, const QString& urn)
{
  return m_implementation->EditCluster(subject.Id(), cluster,
                                       [&](const NMX::IEntryEditor&, NMX::SmartCluster& edited) -> IResult
                                       {
                                         edited.deviceUrn = urn.toStdString();
                                         return EResult::Ok;
                                       });
}

VResultGadget VSubjectPanelQml::setAutoPatternManagement(bool on)
{
  return m_implementation->backend.Edit([&](NMX::IEntryEditor& editor)
                                        { return editor.SetApplicationEntry(Paths::AutoPatternManagement(), on); });
}

VResultGadget VSubjectPanelQml::rebootDevices(const QStringList& urns)
{
  const auto devices = m_implementation->backend.Get(&IPanelServices::Devices);
  if (!devices)
    return IResult(EResult::NotAvailable);
  VResultGadget result = IResult(urns.isEmpty() ? EResult::InvalidArgument : EResult::Ok);
  for (const QString& urn : urns)
  {
    const IResult rebooted = devices->Reboot(urn.toStdString());
    if (rebooted.Failed() && !result.Failed())
      result = {rebooted,
                "\"" + urn.toStdString() + "\" cannot be restarted: " + VResultGadget(rebooted).Reason().toStdString()};
  }
  return result;
}

QVariantList VSubjectPanelQml::candidatesFor(const VSelectionItemGadget& slot) const
{
  return PanelQuestions::CandidatesFor(m_implementation->backend, slot.Item());
}

QVariantList VSubjectPanelQml::slotsFor(const VStoreIdGadget& subject) const
{
  return PanelQuestions::SlotsFor(m_implementation->backend, subject.Id());
}

QVariantList VSubjectPanelQml::markers(const VStoreIdGadget& subject) const
{
  return PanelQuestions::Markers(m_implementation->backend, subject.Id());
}

QVariantList VSubjectPanelQml::confusableWith(const VStoreIdGadget& subject) const
{
  return PanelQuestions::ConfusableWith(m_implementation->backend, subject.Id());
}

QVariantList VSubjectPanelQml::warningsOf(const VStoreIdGadget& subject) const
{
  return PanelQuestions::WarningsOf(m_implementation->backend, subject.Id());
}

}
