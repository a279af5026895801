#pragma once

#include "SubjectStoreUI/ResultGadget.h"
#include "SubjectStoreUI/SubjectGadgets.h"
#include "SubjectStoreUI/VObjectEvaluationQml.h"
#include "SubjectStoreUI/VSubjectCalibrationQml.h"

#include <QAbstractItemModel>
#include <QObject>
#include <QUrl>
#include <QVariantList>

#include <memory>

namespace RunaCorePluginInterface
{
class IObjectPresetProvider;
}

namespace SubjectStoreUI
{

struct PanelBackend;

/// What the panel works with beside the singleton "SubjectStore": the selection, what is edited of single subjects,
/// subjects made from templates, devices, evaluation and calibration. QML knows it as "rootContextSubjectPanel".
/// Conventions are those of VSubjectStoreQml. [gui]
class VSubjectPanelQml : public QObject
{
  Q_OBJECT
  /// VSelectionItemGadget, in the order in which they were selected. A subject that leaves the store leaves it too.
  Q_PROPERTY(QVariantList selection READ selection NOTIFY selectionChanged)
  /// VStoreIdGadget of the subjects among them.
  Q_PROPERTY(QVariantList selectedSubjects READ selectedSubjects NOTIFY selectionChanged)
  /// The id of no subject.
  Q_PROPERTY(SubjectStoreUI::VStoreIdGadget noSubject READ noSubject CONSTANT)
  /// VPanelRowsModel: all sections, one below the other.
  Q_PROPERTY(QAbstractItemModel* rows READ rows CONSTANT)
  /// VDeviceModel.
  Q_PROPERTY(QAbstractItemModel* devices READ devices CONSTANT)
  /// Null when the host has none.
  Q_PROPERTY(SubjectStoreUI::VSubjectCalibrationQml* calibration READ calibration CONSTANT)
  Q_PROPERTY(SubjectStoreUI::VObjectEvaluationQml* evaluation READ evaluation CONSTANT)
  /// Grows by one with each change of the store that somebody could see: bind to it what asks the store a question.
  Q_PROPERTY(int revision READ revision NOTIFY revisionChanged)
  /// Whether the host assigns active marker patterns by itself.
  Q_PROPERTY(bool autoPatternManagement READ autoPatternManagement NOTIFY revisionChanged)

public:
  /// `sections` are VSortSubjectsProxyModel; `backend` outlives this.
  VSubjectPanelQml(const PanelBackend& backend, const QObjectList& sections);
  ~VSubjectPanelQml() override;

  void SetObjectPresetProvider(std::shared_ptr<RunaCorePluginInterface::IObjectPresetProvider> provider);

  [[nodiscard]] QVariantList selection() const;
  [[nodiscard]] QVariantList selectedSubjects() const;
  [[nodiscard]] VStoreIdGadget noSubject() const { return {}; }
  [[nodiscard]] QAbstractItemModel* rows() const;
  [[nodiscard]] QAbstractItemModel* devices() const;
  [[nodiscard]] VSubjectCalibrationQml* calibration() const;
  [[nodiscard]] VObjectEvaluationQml* evaluation() const;
  [[nodiscard]] int revision() const;
  [[nodiscard]] bool autoPatternManagement() const;

  /// Selects these items (VSelectionItemGadget) and nothing else.
  Q_INVOKABLE void select(const QVariantList& items);
  /// The selection items of a subject, of a slot of a character, of a device.
  Q_INVOKABLE [[nodiscard]] SubjectStoreUI::VSelectionItemGadget
  itemOf(const SubjectStoreUI::VStoreIdGadget& subject) const;
  Q_INVOKABLE [[nodiscard]] SubjectStoreUI::VSelectionItemGadget itemOfDevice(const QString& urn) const;

  /// Why a subject cannot have that name, for people; empty when it can. The invalid id stands for a new subject.
  Q_INVOKABLE [[nodiscard]] QString nameProblem(const QString& name,
                                                const SubjectStoreUI::VStoreIdGadget& subject) const;

  /// Colours are "#aarrggbb"; empty when the subject has none.
  Q_INVOKABLE [[nodiscard]] QString colour(const SubjectStoreUI::VStoreIdGadget& subject) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget setColour(const QVariantList& subjects, const QString& colour);

  /// Groups of objects that look alike and are told apart by their neighbours; an empty name for none.
  Q_INVOKABLE [[nodiscard]] QString proximityGroup(const SubjectStoreUI::VStoreIdGadget& subject) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget setProximityGroup(const QVariantList& subjects, const QString& name);
  Q_INVOKABLE [[nodiscard]] QString templateGroup(const SubjectStoreUI::VStoreIdGadget& subject) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget setTemplateGroup(const QVariantList& subjects, const QString& name);
  /// The names in use, in alphabetical order.
  Q_INVOKABLE [[nodiscard]] QStringList proximityGroups() const;
  Q_INVOKABLE [[nodiscard]] QStringList templateGroups() const;

  Q_INVOKABLE SubjectStoreUI::VResultGadget setAutoAssign(const QVariantList& subjects, bool on);
  Q_INVOKABLE SubjectStoreUI::VResultGadget applyPreset(const SubjectStoreUI::VStoreIdGadget& preset,
                                                        const QVariantList& subjects);

  // From a template, which is a file: see SubjectStore.Paths.
  Q_INVOKABLE SubjectStoreUI::VResultGadget addBasicObject(const QString& name);
  Q_INVOKABLE SubjectStoreUI::VResultGadget addSmartObject(const QString& name, const QUrl& file);
  Q_INVOKABLE SubjectStoreUI::VResultGadget addCharacter(const QString& name, const QUrl& file);

  /// The pattern of a cluster; 0 for none. `setClusterPattern` refuses what its device type does not have.
  Q_INVOKABLE SubjectStoreUI::VResultGadget setClusterPattern(const SubjectStoreUI::VStoreIdGadget& subject,
                                                              int cluster, int pattern);
  /// Links a cluster to a device; an empty URN for none.
  Q_INVOKABLE SubjectStoreUI::VResultGadget setClusterDevice(const SubjectStoreUI::VStoreIdGadget& subject, int cluster,
                                                             const QString& urn);
  Q_INVOKABLE SubjectStoreUI::VResultGadget setAutoPatternManagement(bool on);
  /// Restarts devices. All are tried; the first failure is the result.
  Q_INVOKABLE SubjectStoreUI::VResultGadget rebootDevices(const QStringList& urns);

  /// The objects that can be put into that slot: an array of {id, name}, in the order of their names.
  Q_INVOKABLE [[nodiscard]] QVariantList candidatesFor(const SubjectStoreUI::VSelectionItemGadget& slot) const;
  /// The empty slots that the object can be put into: an array of {item, name}, "character / slot".
  Q_INVOKABLE [[nodiscard]] QVariantList slotsFor(const SubjectStoreUI::VStoreIdGadget& subject) const;

  /// What is drawn of an object: an array of {x, y, z, pattern} in mm; pattern 0 for none. Its own markers are in its
  /// own frame. Those of its clusters are as their device types have them: the first cluster's in that frame too, and,
  /// as it is not known where the clusters sit, each other cluster's beside the one before it.
  Q_INVOKABLE [[nodiscard]] QVariantList markers(const SubjectStoreUI::VStoreIdGadget& subject) const;
  /// The objects that evaluation has found to match it: an array of {id, name, distance}, the distance in mm, the
  /// closest first.
  Q_INVOKABLE [[nodiscard]] QVariantList confusableWith(const SubjectStoreUI::VStoreIdGadget& subject) const;
  /// What a subject is warned of: VWarningGadget, with a sentence about this one subject each.
  Q_INVOKABLE [[nodiscard]] QVariantList warningsOf(const SubjectStoreUI::VStoreIdGadget& subject) const;

Q_SIGNALS:
  void selectionChanged();
  void revisionChanged();
  /// This object made it.
  void subjectAdded(const SubjectStoreUI::VStoreIdGadget& subject);

private:
  struct Implementation;
  const std::unique_ptr<Implementation> m_implementation;
};

}
