import QtQuick
import QtQuick.Controls
import QtQuick.Layouts

/// A preset in the list of presets.
ItemDelegate {
    id: row

    required property int index
    required property var storeId
    required property string name
    required property bool readOnly

    readonly property bool current: ListView.isCurrentItem
    readonly property bool inFocus: ListView.view !== null && ListView.view.activeFocus

    height: Theme.rowHeight + Theme.unit
    leftPadding: Theme.margin
    rightPadding: Theme.margin
    topPadding: 0
    bottomPadding: 0
    focusPolicy: Qt.NoFocus
    Accessible.role: Accessible.ListItem
    Accessible.name: readOnly ? qsTr("%1, read-only").arg(name) : name
    Accessible.selected: current

    contentItem: RowLayout {
        spacing: Theme.margin

        ElidedLabel {
            Layout.fillWidth: true
            text: row.name
        }
        Label {
            visible: row.readOnly
            text: qsTr("Read-only")
            color: Theme.secondaryText
            font.pixelSize: Theme.smallFont
        }
    }
    background: Rectangle {
        color: row.current ? (row.inFocus ? Theme.selected : Theme.selectedInactive) : row.hovered ? Theme.hovered : "transparent"
        border.width: row.current && row.inFocus ? 2 : 0
        border.color: Theme.highlight
    }
}
