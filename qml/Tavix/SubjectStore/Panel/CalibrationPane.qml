import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore 1.0

/// Drives the calibration of a subject: which, how far it is, and what can be done now.
ScrollPane {
    id: pane

    required property var panel

    readonly property var calibration: panel ? panel.calibration : null
    readonly property bool running: calibration !== null && calibration.running

    signal finished(var result)

    /// Reasons that hold for several commands are told once.
    function distinct(texts: var): var {
        return texts.filter((text, index) => text !== "" && texts.indexOf(text) === index)
    }

    emptyTitle: calibration ? "" : qsTr("No calibration")
    emptyText: qsTr("This host does not calibrate subjects.")

    component Reasons: Column {
        id: list

        property var texts: []

        width: parent.width
        visible: texts.length > 0
        spacing: Theme.spacing / 2

        Repeater {
            model: list.texts

            Label {
                required property string modelData

                width: parent.width
                text: modelData
                textFormat: Text.PlainText
                color: Theme.secondaryText
                wrapMode: Text.Wrap
            }
        }
    }

    Rectangle {
        width: parent.width
        implicitHeight: state.implicitHeight + 2 * Theme.margin
        color: Theme.surface
        radius: Theme.radius
        border.color: pane.running ? Theme.running : Theme.line

        Column {
            id: state

            anchors.left: parent.left
            anchors.right: parent.right
            anchors.verticalCenter: parent.verticalCenter
            anchors.margins: Theme.margin
            spacing: Theme.spacing

            RowLayout {
                width: parent.width
                spacing: Theme.margin

                Rectangle {
                    implicitWidth: 2.5 * Theme.unit
                    implicitHeight: implicitWidth
                    radius: width / 2
                    color: pane.running ? Theme.running : "transparent"
                    border.color: pane.running ? Theme.running : Theme.secondaryText
                    border.width: 1.5
                }
                Label {
                    Layout.fillWidth: true
                    text: pane.calibration ? pane.calibration.state : ""
                    color: pane.running ? Theme.running : Theme.text
                    font.bold: true
                    wrapMode: Text.Wrap
                    Accessible.name: qsTr("State of the calibration: %1").arg(text)
                }
            }
            ProgressLine {
                width: parent.width
                visible: pane.running
                indeterminate: true
                Accessible.name: qsTr("A calibration is running")
            }
            Label {
                width: parent.width
                visible: !pane.running && text !== ""
                text: pane.calibration && pane.calibration.lastResult ? qsTr("Last run: %1").arg(pane.calibration.lastResult) : ""
                textFormat: Text.PlainText
                color: Theme.secondaryText
                wrapMode: Text.Wrap
            }
        }
    }
    PaneHeading {
        width: parent.width
        text: qsTr("Subject")
    }
    ParameterForm {
        width: parent.width
        enabled: !pane.running
        model: SubjectStore.subjectSetupParameterModel
        keys: ["CreateSubjectName", "CreateSubjectTemplate", "CreateSubjectSkin"]
        panel: pane.panel
        onFinished: result => pane.finished(result)
    }
    Flow {
        width: parent.width
        spacing: Theme.spacing

        CommandButton {
            id: start

            reason: pane.calibration ? pane.calibration.cannotStart : ""
            toolTip: qsTr("Makes the subject and calibrates it.")
            primary: true
            action: Action {
                text: qsTr("Start")
                enabled: start.reason === ""
                onTriggered: pane.finished(pane.calibration.start())
            }
        }
        CommandButton {
            id: recalibrate

            reason: pane.calibration ? pane.calibration.cannotRecalibrate : ""
            toolTip: qsTr("Calibrates the subject that has this name already.")
            primary: start.reason !== ""
            action: Action {
                text: qsTr("Recalibrate")
                enabled: recalibrate.reason === ""
                onTriggered: pane.finished(pane.calibration.recalibrate())
            }
        }
    }
    Reasons {
        texts: pane.calibration && !pane.running ? pane.distinct([start.reason, recalibrate.reason]) : []
    }
    PaneHeading {
        width: parent.width
        text: qsTr("Run")
    }
    Flow {
        width: parent.width
        spacing: Theme.spacing

        CommandButton {
            id: accept

            reason: pane.calibration ? pane.calibration.cannotAcceptTPose : ""
            toolTip: qsTr("The T-pose that was found is right: go on with it.")
            primary: true
            action: Action {
                text: qsTr("Accept T-pose")
                enabled: accept.reason === ""
                onTriggered: pane.finished(pane.calibration.acceptTPose())
            }
        }
        CommandButton {
            id: stop

            reason: pane.calibration ? pane.calibration.cannotStop : ""
            toolTip: qsTr("Ends the calibration with what has been measured so far.")
            primary: true
            action: Action {
                text: qsTr("Stop")
                enabled: stop.reason === ""
                onTriggered: pane.finished(pane.calibration.stop())
            }
        }
        CommandButton {
            id: cancel

            reason: pane.calibration ? pane.calibration.cannotCancel : ""
            toolTip: qsTr("Ends the calibration and leaves the subject as it was.")
            action: Action {
                text: qsTr("Cancel")
                enabled: cancel.reason === ""
                onTriggered: pane.finished(pane.calibration.cancel())
            }
        }
    }
    Reasons {
        texts: pane.calibration ? pane.distinct([accept.reason, stop.reason, cancel.reason]) : []
    }
}
