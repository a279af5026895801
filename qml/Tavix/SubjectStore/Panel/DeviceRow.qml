import QtQuick
import QtQuick.Controls
import QtQuick.Layouts

/// A device: its state, its address, and the smart object that it is linked to.
Control {
    id: row

    required property int index
    required property string urn
    required property string type
    required property bool connected
    required property bool charging
    required property int battery
    required property string linkedTo

    property bool selected: false
    property bool marked: false
    /// Modifiers of the last click.
    property int modifiers: Qt.NoModifier

    readonly property string details: qsTr("%1 · %2").arg(type).arg(linkedTo !== "" ? qsTr("linked to %1").arg(linkedTo) : qsTr("not linked"))
    readonly property string stateText: connected ? charging ? qsTr("charging, %1 %").arg(battery) : qsTr("%1 %").arg(battery) : qsTr("not connected")

    height: Math.round(Theme.rowHeight * 1.75)
    leftPadding: Theme.margin
    rightPadding: Theme.margin
    topPadding: 0
    bottomPadding: 0
    hoverEnabled: true
    Accessible.role: Accessible.ListItem
    Accessible.name: qsTr("%1, %2, %3").arg(urn).arg(details).arg(stateText)
    Accessible.selected: selected

    contentItem: RowLayout {
        spacing: Theme.margin

        Rectangle {
            implicitWidth: 2.25 * Theme.unit
            implicitHeight: implicitWidth
            radius: width / 2
            color: row.connected ? Theme.good : "transparent"
            border.color: row.connected ? Theme.good : Theme.secondaryText
            border.width: 1.5
        }
        ColumnLayout {
            Layout.fillWidth: true
            spacing: 0

            ElidedLabel {
                Layout.fillWidth: true
                text: row.urn
                color: row.connected ? Theme.text : Theme.secondaryText
                elide: Text.ElideMiddle
            }
            ElidedLabel {
                Layout.fillWidth: true
                text: row.details
                color: Theme.secondaryText
                font.pixelSize: Theme.smallFont
            }
        }
        Label {
            text: row.connected ? qsTr("%1 %").arg(row.battery) : qsTr("Not connected")
            color: row.connected && row.battery < 15 && !row.charging ? Theme.critical : Theme.secondaryText
            font.pixelSize: Theme.smallFont
            Layout.maximumWidth: row.width * 0.35
            elide: Text.ElideRight
        }
        BatteryIndicator {
            visible: row.connected
            level: row.battery
            charging: row.charging
        }
    }
    background: Rectangle {
        color: row.selected ? (row.ListView.view && row.ListView.view.activeFocus ? Theme.selected : Theme.selectedInactive) : row.hovered ? Theme.hovered : "transparent"
        border.width: row.marked ? 2 : 0
        border.color: Theme.highlight
    }
}
