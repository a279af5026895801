import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore 1.0

/// Scales the selected object to distances that somebody has measured between its markers.
Dialog {
    id: dialog

    property string name
    property var operation: null
    readonly property var measurements: operation ? operation.measurements : null

    signal finished(var result)

    function start() {
        dialog.operation = SubjectStore.createCalibrationScalingOperation()
        if (dialog.operation)
            dialog.open()
        else
            dialog.finished({ "failed": true, "name": "NotAvailable", "reason": qsTr("The selected object cannot be scaled.") })
    }
    function apply() {
        const result = dialog.operation.apply()
        failure.show(result)
        if (!result.failed) {
            dialog.operation = null
            dialog.close()
            dialog.finished(result)
        }
    }
    function add() {
        failure.show(dialog.operation.add(first.currentIndex, second.currentIndex))
    }

    parent: Overlay.overlay
    anchors.centerIn: parent
    width: parent ? Math.min(parent.width - 2 * Theme.margin, 110 * Theme.unit) : 0
    height: parent ? Math.min(parent.height - 2 * Theme.margin, implicitHeight) : 0
    modal: true
    padding: 2 * Theme.margin
    title: qsTr("Scale %1").arg(name)
    closePolicy: Popup.CloseOnEscape
    onOpened: first.forceActiveFocus()
    onClosed: {
        if (dialog.operation)
            dialog.operation.cancel()
        dialog.operation = null
        failure.text = ""
    }

    Overlay.modal: Rectangle {
        color: Qt.alpha("black", 0.45)
    }
    background: Rectangle {
        color: Theme.window
        radius: 2 * Theme.radius
        border.color: Theme.line
    }
    header: Label {
        text: dialog.title
        textFormat: Text.PlainText
        color: Theme.text
        font.bold: true
        elide: Text.ElideRight
        padding: 2 * Theme.margin
        bottomPadding: 0
    }
    ColumnLayout {
        anchors.fill: parent
        spacing: Theme.margin

        Label {
            Layout.fillWidth: true
            text: qsTr("Choose two markers, add them, and enter the distance that you have measured. The object is scaled by the mean of what the measurements say.")
            color: Theme.secondaryText
            wrapMode: Text.Wrap
        }
        RowLayout {
            Layout.fillWidth: true
            spacing: Theme.spacing

            PanelComboBox {
                id: first

                Layout.fillWidth: true
                Layout.preferredWidth: 1
                model: dialog.operation ? dialog.operation.markerNames : []
                Accessible.name: qsTr("First marker")
            }
            PanelComboBox {
                id: second

                Layout.fillWidth: true
                Layout.preferredWidth: 1
                model: dialog.operation ? dialog.operation.markerNames : []
                onModelChanged: currentIndex = Math.min(1, count - 1)
                Accessible.name: qsTr("Second marker")
            }
        }
        CommandButton {
            reason: first.currentIndex === second.currentIndex ? qsTr("Choose two different markers.") : ""
            toolTip: qsTr("Adds a measurement between these markers.")
            action: Action {
                text: qsTr("Add measurement")
                enabled: dialog.operation !== null && first.currentIndex !== second.currentIndex
                onTriggered: dialog.add()
            }
        }
        MeasurementTable {
            id: table

            Layout.fillWidth: true
            Layout.fillHeight: true
            Layout.minimumHeight: 3 * Theme.rowHeight
            Layout.preferredHeight: 8 * Theme.rowHeight
            measurements: dialog.measurements
            onRemove: row => dialog.operation.remove(row)
        }
        RowLayout {
            Layout.fillWidth: true
            spacing: Theme.spacing

            Label {
                Layout.fillWidth: true
                text: qsTr("Scale factor")
                color: Theme.secondaryText
            }
            Label {
                text: dialog.operation ? Number(dialog.operation.scaleFactor).toLocaleString(Qt.locale(), "f", 4) : ""
                color: Theme.text
                font.bold: true
                Accessible.name: qsTr("Scale factor: %1").arg(text)
            }
        }
        FailureBar {
            id: failure

            Layout.fillWidth: true
        }
    }
    footer: Item {
        implicitHeight: buttons.implicitHeight + 2 * Theme.margin

        RowLayout {
            id: buttons

            anchors.right: parent.right
            anchors.rightMargin: 2 * Theme.margin
            anchors.verticalCenter: parent.verticalCenter
            spacing: Theme.spacing

            CommandButton {
                action: Action {
                    text: qsTr("Cancel")
                    onTriggered: dialog.close()
                }
            }
            CommandButton {
                id: applying

                reason: table.count === 0 ? qsTr("Add a measurement first.") : table.complete ? "" : qsTr("Enter all the distances that you have measured.")
                primary: true
                action: Action {
                    text: qsTr("Scale")
                    enabled: applying.reason === ""
                    onTriggered: dialog.apply()
                }
            }
        }
    }
}
