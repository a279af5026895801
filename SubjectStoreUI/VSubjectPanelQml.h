#pragma once

#include "SubjectStoreUI/ResultGadget.h"
#include "SubjectStoreUI/SubjectGadgets.h"

#include <QAbstractItemModel>
#include <QObject>
#include <QUrl>
#include <QVariantList>

namespace SubjectStoreUI
{

class VObjectEvaluationQml;
class VSubjectCalibrationQml;

/// What the panel works with beside the singleton "SubjectStore": the selection, what is edited of single subjects,
/// subjects made from templates, devices, evaluation and calibration. QML knows it as "rootContextSubjectPanel".
/// Conventions are those of VSubjectStoreQml. [gui]
class VSubjectPanelQml : public QObject
{
  Q_OBJECT
  /// VSelectionItemGadget, in the order in which they were selected.
  Q_PROPERTY(QVariantList selection READ selection NOTIFY selectionChanged)
  /// VStoreIdGadget of the subjects among them.
  Q_PROPERTY(QVariantList selectedSubjects READ selectedSubjects NOTIFY selectionChanged)
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
  using QObject::QObject;

  [[nodiscard]] virtual QVariantList selection() const = 0;
  [[nodiscard]] virtual QVariantList selectedSubjects() const = 0;
  [[nodiscard]] virtual QAbstractItemModel* devices() const = 0;
  [[nodiscard]] virtual VSubjectCalibrationQml* calibration() const = 0;
  [[nodiscard]] virtual VObjectEvaluationQml* evaluation() const = 0;
  [[nodiscard]] virtual int revision() const = 0;
  [[nodiscard]] virtual bool autoPatternManagement() const = 0;

  /// Selects these items (VSelectionItemGadget) and nothing else.
  Q_INVOKABLE virtual void select(const QVariantList& items) = 0;
  /// The selection items of a subject, of a slot of a character, of a device.
  Q_INVOKABLE [[nodiscard]] virtual SubjectStoreUI::VSelectionItemGadget
  itemOf(const SubjectStoreUI::VStoreIdGadget& subject) const = 0;
  Q_INVOKABLE [[nodiscard]] virtual SubjectStoreUI::VSelectionItemGadget itemOfDevice(const QString& urn) const = 0;

  /// Why a subject cannot have that name, for people; empty when it can. The invalid id stands for a new subject.
  Q_INVOKABLE [[nodiscard]] virtual QString nameProblem(const QString& name,
                                                        const SubjectStoreUI::VStoreIdGadget& subject) const = 0;

  /// Colours are "#aarrggbb"; empty when the subject has none.
  Q_INVOKABLE [[nodiscard]] virtual QString colour(const SubjectStoreUI::VStoreIdGadget& subject) const = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget setColour(const QVariantList& subjects, const QString& colour) = 0;

  /// Groups of objects that look alike and are told apart by their neighbours; an empty name for none.
  Q_INVOKABLE [[nodiscard]] virtual QString proximityGroup(const SubjectStoreUI::VStoreIdGadget& subject) const = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget setProximityGroup(const QVariantList& subjects,
                                                                      const QString& name) = 0;
  Q_INVOKABLE [[nodiscard]] virtual QString templateGroup(const SubjectStoreUI::VStoreIdGadget& subject) const = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget setTemplateGroup(const QVariantList& subjects,
                                                                     const QString& name) = 0;
  /// The names in use, in alphabetical order.
  Q_INVOKABLE [[nodiscard]] virtual QStringList proximityGroups() const = 0;
  Q_INVOKABLE [[nodiscard]] virtual QStringList templateGroups() const = 0;

  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget setAutoAssign(const QVariantList& subjects, bool on) = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget applyPreset(const SubjectStoreUI::VStoreIdGadget& preset,
                                                                const QVariantList& subjects) = 0;

  // From a template, which is a file: see SubjectStore.Paths.
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget addBasicObject(const QString& name) = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget addSmartObject(const QString& name, const QUrl& file) = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget addCharacter(const QString& name, const QUrl& file) = 0;

  /// The pattern of a cluster; 0 for none. `setClusterPattern` refuses what its device type does not have.
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget setClusterPattern(const SubjectStoreUI::VStoreIdGadget& subject,
                                                                      int cluster, int pattern) = 0;
  /// Links a cluster to a device; an empty URN for none.
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget setClusterDevice(const SubjectStoreUI::VStoreIdGadget& subject,
                                                                     int cluster, const QString& urn) = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget setAutoPatternManagement(bool on) = 0;

  /// The objects that can be put into that slot: an array of {id, name}, in the order of their names.
  Q_INVOKABLE [[nodiscard]] virtual QVariantList
  candidatesFor(const SubjectStoreUI::VSelectionItemGadget& slot) const = 0;
  /// The empty slots that the object can be put into: an array of {item, name}, "character / slot".
  Q_INVOKABLE [[nodiscard]] virtual QVariantList slotsFor(const SubjectStoreUI::VStoreIdGadget& subject) const = 0;

  /// What is drawn of an object: an array of {x, y, z, pattern} in mm in its own frame; pattern 0 for none.
  Q_INVOKABLE [[nodiscard]] virtual QVariantList markers(const SubjectStoreUI::VStoreIdGadget& subject) const = 0;
  /// The objects that evaluation has found to match it: an array of {id, name, distance}, the distance in mm, the
  /// closest first.
  Q_INVOKABLE [[nodiscard]] virtual QVariantList
  confusableWith(const SubjectStoreUI::VStoreIdGadget& subject) const = 0;
  /// What a subject is warned of: VWarningGadget, with a sentence about this one subject each.
  Q_INVOKABLE [[nodiscard]] virtual QVariantList warningsOf(const SubjectStoreUI::VStoreIdGadget& subject) const = 0;

Q_SIGNALS:
  void selectionChanged();
  void revisionChanged();
};

/// Object evaluation: whether it runs, and with which settings. [gui]
class VObjectEvaluationQml : public QObject
{
  Q_OBJECT
  Q_PROPERTY(bool enabled READ enabled NOTIFY changed)
  /// Distance in mm below which objects are warned of.
  Q_PROPERTY(double warningThreshold READ warningThreshold NOTIFY changed)
  Q_PROPERTY(double maximumStepCount READ maximumStepCount NOTIFY changed)

public:
  using QObject::QObject;

  [[nodiscard]] virtual bool enabled() const = 0;
  [[nodiscard]] virtual double warningThreshold() const = 0;
  [[nodiscard]] virtual double maximumStepCount() const = 0;

  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget setEnabled(bool enabled) = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget setWarningThreshold(double distance) = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget setMaximumStepCount(double count) = 0;

Q_SIGNALS:
  void changed();
};

/// The calibration of subjects: what goes on, and what can be done now and why not. Its settings (name, template, skin)
/// are parameters of SubjectStore.subjectSetupParameterModel. [gui]
class VSubjectCalibrationQml : public QObject
{
  Q_OBJECT
  /// "Not running", "Looking for the T-pose", … in words.
  Q_PROPERTY(QString state READ state NOTIFY changed)
  Q_PROPERTY(bool running READ running NOTIFY changed)
  /// How the last run ended, in words; empty when there has been none.
  Q_PROPERTY(QString lastResult READ lastResult NOTIFY changed)
  // What is possible; the reason why not is empty when it is.
  Q_PROPERTY(QString cannotStart READ cannotStart NOTIFY changed)
  Q_PROPERTY(QString cannotRecalibrate READ cannotRecalibrate NOTIFY changed)
  Q_PROPERTY(QString cannotAcceptTPose READ cannotAcceptTPose NOTIFY changed)
  Q_PROPERTY(QString cannotStop READ cannotStop NOTIFY changed)
  Q_PROPERTY(QString cannotCancel READ cannotCancel NOTIFY changed)

public:
  using QObject::QObject;

  [[nodiscard]] virtual QString state() const = 0;
  [[nodiscard]] virtual bool running() const = 0;
  [[nodiscard]] virtual QString lastResult() const = 0;
  [[nodiscard]] virtual QString cannotStart() const = 0;
  [[nodiscard]] virtual QString cannotRecalibrate() const = 0;
  [[nodiscard]] virtual QString cannotAcceptTPose() const = 0;
  [[nodiscard]] virtual QString cannotStop() const = 0;
  [[nodiscard]] virtual QString cannotCancel() const = 0;

  /// Makes the subject of the settings and calibrates it.
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget start() = 0;
  /// Calibrates the subject that has the name of the settings already.
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget recalibrate() = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget acceptTPose() = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget stop() = 0;
  Q_INVOKABLE virtual SubjectStoreUI::VResultGadget cancel() = 0;

Q_SIGNALS:
  void changed();
};

}
