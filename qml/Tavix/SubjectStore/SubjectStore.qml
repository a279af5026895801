pragma Singleton
import QtQuick

/// The subject store for QML: passes everything on to the object that the plugin has published. Without that, as in a
/// design tool, lists are empty, nothing is possible, and operations fail.
QtObject {
    id: store

    // qmllint disable unqualified
    readonly property var backEnd: typeof rootContextSubjectStore === "undefined" ? null : rootContextSubjectStore
    // qmllint enable unqualified

    readonly property var subjectWarnings: backEnd ? backEnd.subjectWarnings : []
    readonly property double objectEvaluationProgressDone: backEnd ? backEnd.objectEvaluationProgressDone : 0
    readonly property double objectEvaluationProgressRequired: backEnd ? backEnd.objectEvaluationProgressRequired : 0
    readonly property var subjectTypeModels: backEnd ? backEnd.subjectTypeModels : []
    readonly property var subjectSetupParameterModel: backEnd ? backEnd.subjectSetupParameterModel : null
    readonly property var selectedSubjectParameterModel: backEnd ? backEnd.selectedSubjectParameterModel : null
    readonly property var objectPresetModel: backEnd ? backEnd.objectPresetModel : null

    /// What operations answer while there is no store.
    readonly property var notAvailable: ({
            "code": 0x80000007,
            "failed": true,
            "name": "NotAvailable",
            "reason": qsTr("The subject store is not available.")
        })

    readonly property Connections forwarding: Connections {
        target: store.backEnd

        function onObjectEvaluationProgressChanged() {
            store.objectEvaluationProgressChanged()
        }

        function onFocusSubject(subjectStoreId) {
            store.focusSubject(subjectStoreId)
        }
    }

    signal objectEvaluationProgressChanged
    signal focusSubject(var subjectStoreId)

    function enabledFeatures() {
        return backEnd ? backEnd.enabledFeatures() : 0
    }

    function subjectStoreIdsBySelectionItems(i_SubjectSelectionItems) {
        return backEnd ? backEnd.subjectStoreIdsBySelectionItems(i_SubjectSelectionItems) : []
    }

    function subjects() {
        return backEnd ? backEnd.subjects() : []
    }

    function subjectNameRegex() {
        return backEnd ? backEnd.subjectNameRegex() : ""
    }

    function isSubjectNameInUse(i_SubjectName: string) {
        return backEnd ? backEnd.isSubjectNameInUse(i_SubjectName) : false
    }

    function subjectName(i_SubjectStoreId) {
        return backEnd ? backEnd.subjectName(i_SubjectStoreId) : ""
    }

    function setSubjectName(i_SubjectStoreId, i_Name: string) {
        return backEnd ? backEnd.setSubjectName(i_SubjectStoreId, i_Name) : notAvailable
    }

    function subjectFlags(i_SubjectStoreId) {
        return backEnd ? backEnd.subjectFlags(i_SubjectStoreId) : 0
    }

    function subjectCalibration(i_SubjectStoreId) {
        return backEnd ? backEnd.subjectCalibration(i_SubjectStoreId) : 0
    }

    function subjectEnabled(i_SubjectStoreId) {
        return backEnd ? backEnd.subjectEnabled(i_SubjectStoreId) : false
    }

    function setSubjectsEnabled(i_SubjectStoreIds, i_bEnabled: bool) {
        return backEnd ? backEnd.setSubjectsEnabled(i_SubjectStoreIds, i_bEnabled) : notAvailable
    }

    function toggleSubjectsEnabled(i_SubjectStoreIds) {
        return backEnd ? backEnd.toggleSubjectsEnabled(i_SubjectStoreIds) : notAvailable
    }

    function rebootSubjects(i_SubjectStoreIds) {
        return backEnd ? backEnd.rebootSubjects(i_SubjectStoreIds) : notAvailable
    }

    function removeSubjects(i_SubjectStoreIds, i_bRemoveChildren: bool) {
        return backEnd ? backEnd.removeSubjects(i_SubjectStoreIds, i_bRemoveChildren) : notAvailable
    }

    function smartClusterCount(i_SubjectStoreId) {
        return backEnd ? backEnd.smartClusterCount(i_SubjectStoreId) : 0
    }

    function smartClusterLabel(i_SubjectStoreId, i_SmartClusterIndex: int) {
        return backEnd ? backEnd.smartClusterLabel(i_SubjectStoreId, i_SmartClusterIndex) : ""
    }

    function loadSubjectConfiguration(i_FilePath: url) {
        return backEnd ? backEnd.loadSubjectConfiguration(i_FilePath) : notAvailable
    }

    function saveSubjectConfiguration(i_FilePath: url) {
        return backEnd ? backEnd.saveSubjectConfiguration(i_FilePath) : notAvailable
    }

    function importSubject(i_FilePath: url, i_bOverwrite: bool) {
        return backEnd ? backEnd.importSubject(i_FilePath, i_bOverwrite) : notAvailable
    }

    function importMesh(i_FilePath: url) {
        return backEnd ? backEnd.importMesh(i_FilePath) : notAvailable
    }

    function exportSubject(i_SubjectStoreId, i_FilePath: url) {
        return backEnd ? backEnd.exportSubject(i_SubjectStoreId, i_FilePath) : notAvailable
    }

    function exportTemplate(i_SubjectStoreId, i_FilePath: url) {
        return backEnd ? backEnd.exportTemplate(i_SubjectStoreId, i_FilePath) : notAvailable
    }

    function canCreateSmartObjects(i_SelectionItems) {
        return backEnd ? backEnd.canCreateSmartObjects(i_SelectionItems) : false
    }

    function createSmartObjects(i_SelectionItems) {
        return backEnd ? backEnd.createSmartObjects(i_SelectionItems) : notAvailable
    }

    function assignOptimalActiveMarkerPatterns(i_SelectionItems) {
        return backEnd ? backEnd.assignOptimalActiveMarkerPatterns(i_SelectionItems) : notAvailable
    }

    function canMergeSelectedSmartObjects(i_SelectionItems) {
        return backEnd ? backEnd.canMergeSelectedSmartObjects(i_SelectionItems) : false
    }

    function mergeSelectedSmartObjects(i_SelectionItems) {
        return backEnd ? backEnd.mergeSelectedSmartObjects(i_SelectionItems) : notAvailable
    }

    function canSplitSelectedSmartObjects(i_SelectionItems) {
        return backEnd ? backEnd.canSplitSelectedSmartObjects(i_SelectionItems) : false
    }

    function splitSelectedSmartObjects(i_SelectionItems) {
        return backEnd ? backEnd.splitSelectedSmartObjects(i_SelectionItems) : notAvailable
    }

    function canSwapSmartClusters(i_FirstSubjectId, i_SecondSubjectId) {
        return backEnd ? backEnd.canSwapSmartClusters(i_FirstSubjectId, i_SecondSubjectId) : false
    }

    function swapSmartClusters(i_FirstSubjectId, i_SecondSubjectId, i_FirstClusterIndex: int, i_SecondClusterIndex: int) {
        return backEnd ? backEnd.swapSmartClusters(i_FirstSubjectId, i_SecondSubjectId, i_FirstClusterIndex, i_SecondClusterIndex) : notAvailable
    }

    function calibrateCFC(i_SubjectStoreIds) {
        return backEnd ? backEnd.calibrateCFC(i_SubjectStoreIds) : notAvailable
    }

    function decalibrateCFC(i_SubjectStoreIds) {
        return backEnd ? backEnd.decalibrateCFC(i_SubjectStoreIds) : notAvailable
    }

    function canAssignSubjectToSlot(i_SubjectStoreId, i_EmptySubjectSlotSelectionItem) {
        return backEnd ? backEnd.canAssignSubjectToSlot(i_SubjectStoreId, i_EmptySubjectSlotSelectionItem) : false
    }

    function assignSubjectToSlot(i_SubjectStoreId, i_EmptySubjectSlotSelectionItem) {
        return backEnd ? backEnd.assignSubjectToSlot(i_SubjectStoreId, i_EmptySubjectSlotSelectionItem) : notAvailable
    }

    function canUnassignSubjects(i_SubjectStoreIds) {
        return backEnd ? backEnd.canUnassignSubjects(i_SubjectStoreIds) : false
    }

    function unassignSubjects(i_SubjectStoreIds) {
        return backEnd ? backEnd.unassignSubjects(i_SubjectStoreIds) : notAvailable
    }

    function anySubjectManuallyAssignable() {
        return backEnd ? backEnd.anySubjectManuallyAssignable() : false
    }

    function canDetachClusters(i_SubjectStoreIds) {
        return backEnd ? backEnd.canDetachClusters(i_SubjectStoreIds) : false
    }

    function detachClusters(i_SubjectStoreIds) {
        return backEnd ? backEnd.detachClusters(i_SubjectStoreIds) : notAvailable
    }

    function addModel(i_ModelName: string) {
        return backEnd ? backEnd.addModel(i_ModelName) : notAvailable
    }

    function removeModel(i_ModelName: string) {
        return backEnd ? backEnd.removeModel(i_ModelName) : notAvailable
    }

    function createCalibrationScalingOperation() {
        return backEnd ? backEnd.createCalibrationScalingOperation() : null
    }

    /// Paths of the back end: a function of QML begins with a small letter.
    function paths(i_Type: int) {
        return backEnd ? backEnd.Paths(i_Type) : []
    }

    function copyFileToUserFolder(i_FilePath: url, i_SubjectFileType: int) {
        return backEnd ? backEnd.copyFileToUserFolder(i_FilePath, i_SubjectFileType) : notAvailable
    }
}
