#include "SubjectStoreUI/QmlRegistration.h"

#include "SubjectStoreUI/SubjectTypeGadget.h"
#include "SubjectStoreUI/SubjectsModelRole.h"
#include "SubjectStoreUI/VCalibrationScalingQml.h"
#include "SubjectStoreUI/VStoreObjectPresetModel.h"
#include "SubjectStoreUI/VSubjectPanelQml.h"
#include "SubjectStoreUI/VSubjectStoreQml.h"
#include "SubjectStoreUI/VSubjectWarningSummary.h"
#include "SubjectStoreUI/WarningGadget.h"
#include "SubjectStoreUI/WarningTypes.h"

#include <QQmlEngine>
#include <QtQml>

#include <cstddef>
#include <mutex>
#include <string_view>

/// At global scope: the macro declares a function there.
static void InitResources()
{
  Q_INIT_RESOURCE(SubjectStorePanel);
}

namespace SubjectStoreUI
{

namespace
{

using Constants = std::vector<std::pair<QString, QVariant>>;

constexpr int majorVersion = 1;
constexpr int minorVersion = 0;

QString Text(std::string_view text)
{
  return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

/// The names with 1, 2, 4, … in their order.
Constants Bits(std::initializer_list<const char*> names)
{
  Constants constants;
  int bit = 1;
  for (const char* name : names)
  {
    constants.emplace_back(name, bit);
    bit *= 2;
  }
  return constants;
}

Constants SubjectRoles()
{
  return {{"Labelling", 0}, {"Solving", 1}, {"Retargeting", 2}};
}

Constants SubjectFlags()
{
  return Bits({"Rigid", "Smart", "LabellingCluster", "SolvedFromClusters", "Prop", "Template", "Wand", "Installed",
               "SceneMesh", "Markerless"});
}

Constants SubjectCalibration()
{
  return {{"Uncalibrated", 0}, {"Calibrating", 1}, {"Calibrated", 2}};
}

Constants SubjectStoreFeatures()
{
  return Bits({"BasicObject", "SmartObject", "CharacterFromClusters", "GeneralSubject", "Prop", "LabellingCluster",
               "ObjectPreset", "AllowLegacyVSTs", "ProximityGrouping", "ObjectEvaluation", "VideoCameraTracking",
               "TrackWithObjectTracker", "SceneMesh", "AlignmentTool", "Markerless", "ObjectAutoAssign",
               "GeneralSolvingRole", "GeneralRetargetingRole", "ModelOutput"});
}

/// The warnings that are published, by their type ids, and "Warnings", the group of them all.
Constants SubjectWarnings()
{
  constexpr std::size_t publishedCount = 20;
  Constants constants;
  const auto types = WarningTypes();
  for (std::size_t type = 1; type <= publishedCount; ++type)
    constants.emplace_back(Text(types[type].key), static_cast<int>(type));
  constants.emplace_back("Warnings", 0);
  return constants;
}

template <class Keys>
Constants Roles(const Keys& keys)
{
  Constants constants;
  for (const auto& key : keys)
    constants.emplace_back(Text(key.text), static_cast<int>(key.role));
  return constants;
}

void RegisterConstants(const char* name, Constants (*constants)())
{
  qmlRegisterSingletonType<ConstantMap>(moduleUri, majorVersion, minorVersion, name,
                                        [constants](QQmlEngine*, QJSEngine*) -> QObject*
                                        { return new ConstantMap(constants()); });
}

}

ConstantMap::ConstantMap(const std::vector<std::pair<QString, QVariant>>& constants, QObject* parent)
    : QQmlPropertyMap(this, parent)
{
  for (const auto& [name, value] : constants)
    insert(name, value);
  freeze();
}

QVariant ConstantMap::updateValue(const QString& key, const QVariant& /*input*/)
{
  return keys().contains(key) ? value(key) : QVariant{};
}

void RegisterModule()
{
  static std::once_flag once;
  std::call_once(once,
                 []
                 {
                   qmlRegisterModule(moduleUri, majorVersion, minorVersion);
                   RegisterConstants("SubjectRole", SubjectRoles);
                   RegisterConstants("SubjectFlags", SubjectFlags);
                   RegisterConstants("SubjectCalibration", SubjectCalibration);
                   RegisterConstants("SubjectStoreFeatures", SubjectStoreFeatures);
                   RegisterConstants("SubjectWarning", SubjectWarnings);
                   RegisterConstants("SubjectsModelRole", [] { return Roles(SubjectsModelRole::keys); });
                   RegisterConstants("StoreObjectPresetModel", [] { return Roles(ObjectPresetRole::keys); });
                   qmlRegisterUncreatableType<VSubjectStoreQml>(
                       moduleUri, majorVersion, minorVersion, "SubjectStoreQml",
                       QString("%1 can only be created from c++.").arg("SubjectStoreQml"));
                   // What QML is handed, so that it knows properties, methods and enumerations.
                   qRegisterMetaType<VStoreIdGadget>();
                   qRegisterMetaType<VSelectionItemGadget>();
                   qRegisterMetaType<VResultGadget>();
                   qRegisterMetaType<VSubjectTypeGadget>();
                   qRegisterMetaType<VPositionGadget>();
                   qRegisterMetaType<VWarningGadget>();
                   qRegisterMetaType<VSubjectWarningSummary*>();
                   qRegisterMetaType<VSubjectCalibrationQml*>();
                   qRegisterMetaType<VObjectEvaluationQml*>();
                   qRegisterMetaType<VCalibrationScalingQml*>();
                   qRegisterMetaType<VCalibrationObjectMeasurementModel*>();
                 });
}

void AddModuleFiles(QQmlEngine& engine)
{
  InitResources();
  engine.addImportPath("qrc:/qml");
}

}
