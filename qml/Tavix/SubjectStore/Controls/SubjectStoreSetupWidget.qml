import QtQuick
import Tavix.SubjectStore 1.0
import Tavix.SubjectStore.Panel 1.0

/// The settings with which subjects are made and calibrated.
Column {
    id: widget

    property var panel: null
    readonly property var groups: [
        {
            "title": qsTr("New subject"),
            "feature": SubjectStoreFeatures.GeneralSubject,
            "keys": ["CreateSubjectName", "CreateSubjectTemplate", "CreateSubjectSkin", "CreateSubjectAction"]
        },
        {
            "title": qsTr("New character"),
            "feature": SubjectStoreFeatures.CharacterFromClusters,
            "keys": ["CreateCFCName", "CreateCFCTemplate", "CreateCFCRetarget", "CreateCFCAction"]
        },
        {
            "title": qsTr("New smart object"),
            "feature": SubjectStoreFeatures.SmartObject,
            "keys": ["CreateSmartObjectName", "CreateSmartObjectTemplate", "CreateSmartObjectAction"]
        },
        {
            "title": qsTr("New object"),
            "feature": SubjectStoreFeatures.BasicObject,
            "keys": ["CreateObjectName", "CreateObjectAction"]
        },
        {
            "title": qsTr("New labelling cluster"),
            "feature": SubjectStoreFeatures.LabellingCluster,
            "keys": ["CreateLabellingClusterName", "CreateLabellingClusterAction"]
        },
        {
            "title": qsTr("Calibration"),
            "feature": SubjectStoreFeatures.GeneralSubject,
            "keys": ["CalibrateOnCreate", "CancelledCalibrationGracePeriod"]
        },
        {
            "title": qsTr("Capture"),
            "feature": SubjectStoreFeatures.GeneralSubject,
            "keys": ["EnableCapture", "CaptureVideo", "CaptureProcessed", "CaptureCancelledCalibrations"]
        },
        {
            "title": qsTr("Names"),
            "feature": -1,
            "keys": ["NameRegex"]
        }
    ]

    signal finished(var result)

    spacing: 2 * Theme.margin

    Repeater {
        model: widget.groups

        // qmllint disable unqualified
        Column {
            id: group

            required property var modelData

            width: parent.width
            visible: !form.empty && (SubjectStore.enabledFeatures() & modelData.feature) !== 0
            spacing: Theme.margin

            PaneHeading {
                width: parent.width
                text: group.modelData.title
            }
            ParameterForm {
                id: form

                width: parent.width
                model: SubjectStore.subjectSetupParameterModel
                keys: group.modelData.keys
                panel: widget.panel
                onFinished: result => widget.finished(result)
            }
        }
        // qmllint enable unqualified
    }
}
