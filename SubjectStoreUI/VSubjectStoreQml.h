#pragma once

#include "HostInterface/ISelectionManager.h"
#include "HostInterface/NMX/IPostalService.h"
#include "HostInterface/RunaCorePluginInterface/IPanelServices.h"
#include "StoreInterface/IStore.h"
#include "SubjectStoreUI/ResultGadget.h"
#include "SubjectStoreUI/SubjectGadgets.h"

#include <QAbstractItemModel>
#include <QObject>
#include <QUrl>
#include <QVariantList>

#include <memory>

class QQmlContext;

namespace RunaCorePluginInterface
{
class IObjectPresetProvider;
}

namespace SubjectStoreUI
{

struct PanelBackend;
class VCalibrationScalingQml;

/// The panel's way into the subject store: what QML calls "SubjectStore". Subjects are named by their ids
/// (VStoreIdGadget); lists of them, and of selection items (VSelectionItemGadget), are arrays. What an array holds of
/// another type is left out.
///
/// An operation on several subjects is one edit of the store: all of it or nothing. Each `can…` follows the rule of its
/// operation. Failures come back as a result that says why. [gui]
class VSubjectStoreQml : public QObject
{
  Q_OBJECT
  /// Of the whole store: VWarningGadget, one for each kind of warning that some subject has.
  Q_PROPERTY(QVariantList subjectWarnings READ subjectWarnings NOTIFY subjectWarningsChanged)
  /// Comparisons; both 0 while evaluation is off.
  Q_PROPERTY(
      double objectEvaluationProgressDone READ objectEvaluationProgressDone NOTIFY objectEvaluationProgressChanged)
  Q_PROPERTY(double objectEvaluationProgressRequired READ objectEvaluationProgressRequired NOTIFY
                 objectEvaluationProgressChanged)
  /// One VSortSubjectsProxyModel for each kind of subject that the features allow: a section of the panel.
  Q_PROPERTY(QObjectList subjectTypeModels READ subjectTypeModels CONSTANT)
  /// StoreUI::VStoreParameterModel of the settings with which subjects are made and calibrated.
  Q_PROPERTY(QAbstractItemModel* subjectSetupParameterModel READ subjectSetupParameterModel CONSTANT)
  /// StoreUI::VStoreParameterModel of the first selected subject.
  Q_PROPERTY(QAbstractItemModel* selectedSubjectParameterModel READ selectedSubjectParameterModel CONSTANT)
  /// VStoreObjectPresetModel; null while the feature is off.
  Q_PROPERTY(QAbstractItemModel* objectPresetModel READ objectPresetModel CONSTANT)

public:
  /// What a file is of.
  enum ESubjectFileType : int // QML may hand in any number
  {
    ESubjectTemplate,
    ESmartObjectTemplate,
    ECFCTemplate,
    ERetarget,
    EMarkerlessTemplate,
    ERetargetSkin,
    ESubjectSkin,
    EPropSkin,
    ECharacterSkin,
    ESubjectConfiguration,
    ESubject,
    EProp,
    ELabellingCluster,
    EObject,
    EExportFile
  };
  Q_ENUM(ESubjectFileType)

  /// Publishes itself in `rootContext` as "rootContextSubjectStore". `panelServices` and `selection` may be null: what
  /// needs them is `NotAvailable` then.
  VSubjectStoreQml(QQmlContext* rootContext, std::shared_ptr<ISelectionManager> selection,
                   std::shared_ptr<RunaCorePluginInterface::IPanelServices> panelServices,
                   std::shared_ptr<NMX::IPostalService> gui, std::shared_ptr<NMX::IStore> store);
  ~VSubjectStoreQml() override;

  /// Object presets can be applied from now on.
  void SetObjectPresetProvider(std::shared_ptr<RunaCorePluginInterface::IObjectPresetProvider> provider);

  [[nodiscard]] QVariantList subjectWarnings() const;
  [[nodiscard]] double objectEvaluationProgressDone() const;
  [[nodiscard]] double objectEvaluationProgressRequired() const;
  [[nodiscard]] QObjectList subjectTypeModels() const;
  [[nodiscard]] QAbstractItemModel* subjectSetupParameterModel() const;
  [[nodiscard]] QAbstractItemModel* selectedSubjectParameterModel() const;
  [[nodiscard]] QAbstractItemModel* objectPresetModel() const;

  /// The mask of SubjectStoreFeatures.
  Q_INVOKABLE [[nodiscard]] uint enabledFeatures() const;
  /// In the order of the items, each once; what is no subject is left out.
  Q_INVOKABLE [[nodiscard]] QVariantList
  subjectStoreIdsBySelectionItems(const QVariantList& i_SubjectSelectionItems) const;
  Q_INVOKABLE [[nodiscard]] QVariantList subjects() const;
  Q_INVOKABLE [[nodiscard]] QString subjectNameRegex() const;
  Q_INVOKABLE [[nodiscard]] bool isSubjectNameInUse(const QString& i_SubjectName) const;
  /// Empty when there is no such subject.
  Q_INVOKABLE [[nodiscard]] QString subjectName(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget setSubjectName(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId,
                                                           const QString& i_Name);
  /// A mask of SubjectFlags.
  Q_INVOKABLE [[nodiscard]] uint subjectFlags(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId) const;
  /// A value of SubjectCalibration.
  Q_INVOKABLE [[nodiscard]] int subjectCalibration(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId) const;
  Q_INVOKABLE [[nodiscard]] bool subjectEnabled(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget setSubjectsEnabled(const QVariantList& i_SubjectStoreIds, bool i_bEnabled);
  Q_INVOKABLE SubjectStoreUI::VResultGadget toggleSubjectsEnabled(const QVariantList& i_SubjectStoreIds);
  /// Reboots every device that their clusters are linked to. All are tried; the first failure is the result.
  Q_INVOKABLE SubjectStoreUI::VResultGadget rebootSubjects(const QVariantList& i_SubjectStoreIds);
  Q_INVOKABLE SubjectStoreUI::VResultGadget removeSubjects(const QVariantList& i_SubjectStoreIds,
                                                           bool i_bRemoveChildren);
  Q_INVOKABLE [[nodiscard]] int smartClusterCount(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId) const;
  /// Empty when there is no such cluster.
  Q_INVOKABLE [[nodiscard]] QString smartClusterLabel(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId,
                                                      int i_SmartClusterIndex) const;
  // File operations. A URL that is not that of a local file is `InvalidName`.
  Q_INVOKABLE SubjectStoreUI::VResultGadget loadSubjectConfiguration(const QUrl& i_FilePath);
  Q_INVOKABLE SubjectStoreUI::VResultGadget saveSubjectConfiguration(const QUrl& i_FilePath);
  Q_INVOKABLE SubjectStoreUI::VResultGadget importSubject(const QUrl& i_FilePath, bool i_bOverwrite);
  Q_INVOKABLE SubjectStoreUI::VResultGadget importMesh(const QUrl& i_FilePath);
  Q_INVOKABLE SubjectStoreUI::VResultGadget exportSubject(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId,
                                                          const QUrl& i_FilePath);
  Q_INVOKABLE SubjectStoreUI::VResultGadget exportTemplate(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId,
                                                           const QUrl& i_FilePath);
  /// A smart object for each of the devices among the items.
  Q_INVOKABLE [[nodiscard]] bool canCreateSmartObjects(const QVariantList& i_SelectionItems) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget createSmartObjects(const QVariantList& i_SelectionItems);
  /// Of all smart objects, whatever is selected: patterns are told apart across the whole stage.
  Q_INVOKABLE SubjectStoreUI::VResultGadget assignOptimalActiveMarkerPatterns(const QVariantList& i_SelectionItems);
  /// Moves the clusters of the selected smart objects, two or more, to the first of them; the others are removed.
  Q_INVOKABLE [[nodiscard]] bool canMergeSelectedSmartObjects(const QVariantList& i_SelectionItems) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget mergeSelectedSmartObjects(const QVariantList& i_SelectionItems);
  /// Leaves each selected smart object its first cluster and makes an object of each of the others.
  Q_INVOKABLE [[nodiscard]] bool canSplitSelectedSmartObjects(const QVariantList& i_SelectionItems) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget splitSelectedSmartObjects(const QVariantList& i_SelectionItems);
  /// Exchanges a cluster of one smart object with one of another, or two of the same.
  Q_INVOKABLE [[nodiscard]] bool canSwapSmartClusters(const SubjectStoreUI::VStoreIdGadget& i_FirstSubjectId,
                                                      const SubjectStoreUI::VStoreIdGadget& i_SecondSubjectId) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget swapSmartClusters(const SubjectStoreUI::VStoreIdGadget& i_FirstSubjectId,
                                                              const SubjectStoreUI::VStoreIdGadget& i_SecondSubjectId,
                                                              int i_FirstClusterIndex, int i_SecondClusterIndex);
  Q_INVOKABLE SubjectStoreUI::VResultGadget calibrateCFC(const QVariantList& i_SubjectStoreIds);
  Q_INVOKABLE SubjectStoreUI::VResultGadget decalibrateCFC(const QVariantList& i_SubjectStoreIds);
  /// Puts an object into a slot that is empty.
  Q_INVOKABLE [[nodiscard]] bool
  canAssignSubjectToSlot(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId,
                         const SubjectStoreUI::VSelectionItemGadget& i_EmptySubjectSlotSelectionItem) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget
  assignSubjectToSlot(const SubjectStoreUI::VStoreIdGadget& i_SubjectStoreId,
                      const SubjectStoreUI::VSelectionItemGadget& i_EmptySubjectSlotSelectionItem);
  /// Takes objects out of their slots.
  Q_INVOKABLE [[nodiscard]] bool canUnassignSubjects(const QVariantList& i_SubjectStoreIds) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget unassignSubjects(const QVariantList& i_SubjectStoreIds);
  /// Whether there is an object that could be put into a slot, and a slot for it.
  Q_INVOKABLE [[nodiscard]] bool anySubjectManuallyAssignable() const;
  /// Takes objects out of their slots and keeps them from being assigned automatically.
  Q_INVOKABLE [[nodiscard]] bool canDetachClusters(const QVariantList& i_SubjectStoreIds) const;
  Q_INVOKABLE SubjectStoreUI::VResultGadget detachClusters(const QVariantList& i_SubjectStoreIds);
  /// Switches a model output ("CGM2", "PluginKinex") of the selected subjects on or off.
  Q_INVOKABLE SubjectStoreUI::VResultGadget addModel(const QString& i_ModelName);
  Q_INVOKABLE SubjectStoreUI::VResultGadget removeModel(const QString& i_ModelName);
  /// For the selected object; null, with the reason in the log, when that has no markers. Belongs to this object.
  Q_INVOKABLE [[nodiscard]] SubjectStoreUI::VCalibrationScalingQml* createCalibrationScalingOperation();
  /// The known files of that type, those of the user last.
  Q_INVOKABLE [[nodiscard]] QList<QUrl> Paths(SubjectStoreUI::VSubjectStoreQml::ESubjectFileType i_Type) const;
  /// Never overwrites: `AlreadyPresent` when the user's folder has a file of that name.
  Q_INVOKABLE SubjectStoreUI::VResultGadget
  copyFileToUserFolder(const QUrl& i_FilePath, SubjectStoreUI::VSubjectStoreQml::ESubjectFileType i_SubjectFileType);

Q_SIGNALS:
  void subjectWarningsChanged();
  void objectEvaluationProgressChanged();
  /// The panel is to bring that subject into view.
  void focusSubject(const SubjectStoreUI::VStoreIdGadget& subjectStoreId);

private:
  [[nodiscard]] const PanelBackend& Backend() const;

  struct Implementation;
  const std::unique_ptr<Implementation> m_implementation;
};

}
