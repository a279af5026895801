import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore 1.0

/// The parameters, warnings and markers of the first selected subject.
ScrollPane {
    id: pane

    required property var panel

    readonly property int count: panel ? panel.selectedSubjects.length : 0
    readonly property var subject: count > 0 ? panel.selectedSubjects[0] : null
    readonly property string name: subject ? (panel.revision, SubjectStore.subjectName(subject)) : ""
    readonly property var warnings: subject ? (panel.revision, panel.warningsOf(subject)) : []
    readonly property var groups: [
        { "title": qsTr("General"), "keys": ["Parameters/Name", "Parameters/Enabled", "Parameters/ColourRGBA", "Parameters/PresetName", "Parameters/FilePath"] },
        { "title": qsTr("Groups"), "keys": ["Parameters/ProximityGroupName", "Parameters/TemplateGroupName"] },
        { "title": qsTr("Slots"), "keys": ["Parameters/AutoAssignEnabled", "Parameters/AutoAssignedName", "Parameters/RootSegmentName"] },
        { "title": qsTr("Tracking"), "keys": ["Parameters/EntranceThreshold", "Parameters/LinkedCameraURN", "Parameters/TrackWithObjectTracker", "Parameters/Retarget"] }
    ]
    readonly property var grouped: groups.reduce((keys, group) => keys.concat(group.keys), ["Parameters/Calibration", "Parameters/Flags"])

    signal finished(var result)

    emptyTitle: subject ? "" : qsTr("Nothing is selected")
    emptyText: qsTr("Select a subject in the list to see and change it.")

    Column {
        width: parent.width
        spacing: Theme.spacing

        ElidedLabel {
            width: parent.width
            text: pane.name
            font.bold: true
            font.pixelSize: Math.round(Theme.metrics.font.pixelSize * 1.25)
            Accessible.role: Accessible.Heading
        }
        Label {
            width: parent.width
            visible: pane.count > 1
            text: qsTr("The first of %1 that are selected. A preset is applied to all of them; everything else is changed for this one only.").arg(pane.count)
            color: Theme.secondaryText
            wrapMode: Text.Wrap
        }
        Repeater {
            model: pane.warnings

            FailureLabel {
                required property var modelData

                width: parent.width
                text: modelData.text
                colour: Theme.warning
            }
        }
    }
    Repeater {
        model: pane.groups.concat([{ "title": qsTr("More"), "keys": pane.grouped, "others": true }])

        // qmllint disable unqualified
        Column {
            id: group

            required property var modelData

            width: parent.width
            visible: !form.empty
            spacing: Theme.margin

            PaneHeading {
                width: parent.width
                text: group.modelData.title
            }
            ParameterForm {
                id: form

                width: parent.width
                model: SubjectStore.selectedSubjectParameterModel
                keys: group.modelData.keys
                others: group.modelData.others === true
                panel: pane.panel
                subject: pane.subject
                onFinished: result => pane.finished(result)
            }
        }
        // qmllint enable unqualified
    }
    MarkerView {
        id: markers

        width: parent.width
        visible: markerCount > 0
        panel: pane.panel
        subject: pane.subject
        name: pane.name
        live: pane.visible
    }
    CommandButton {
        visible: markers.markerCount > 1
        toolTip: qsTr("Scales the object to distances that you have measured between its markers.")
        action: Action {
            text: qsTr("Scale to measured distances…")
            onTriggered: scaling.start()
        }
    }
    ScalingDialog {
        id: scaling

        name: pane.name
        onFinished: result => pane.finished(result)
    }
}
