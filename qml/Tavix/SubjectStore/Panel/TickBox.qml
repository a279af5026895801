import QtQuick
import QtQuick.Controls

/// A small check box for rows. It does not change by itself: what it shows comes back from the store.
AbstractButton {
    id: box

    property bool ticked

    implicitWidth: Theme.iconSize
    implicitHeight: Theme.iconSize
    focusPolicy: Qt.NoFocus
    hoverEnabled: true
    Accessible.role: Accessible.CheckBox
    Accessible.checkable: true
    Accessible.checked: ticked

    background: Rectangle {
        radius: Theme.radius
        color: box.ticked ? Theme.highlight : Theme.surface
        border.color: box.ticked ? Theme.highlight : box.hovered ? Theme.text : Theme.secondaryText

        Icon {
            anchors.fill: parent
            anchors.margins: 1
            visible: box.ticked
            name: "check"
            colour: Theme.highlightedText
        }
    }
}
