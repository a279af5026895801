import QtQuick
import QtQuick.Controls

/// A flat button that shows an icon; its command's text is the tooltip.
AbstractButton {
    id: button

    property string symbol
    property string tip: button.action ? button.action.text.replace("&", "").replace("…", "") : ""
    property color colour: !enabled ? Theme.disabledText : checked ? Theme.warning : Theme.text

    implicitWidth: Theme.rowHeight + Theme.unit
    implicitHeight: Theme.rowHeight + Theme.unit
    opacity: enabled ? 1 : 0.6
    focusPolicy: Qt.TabFocus
    hoverEnabled: true
    Accessible.name: tip

    contentItem: Item {
        HoverTip {
            text: button.tip
            offered: !button.down
        }

        Icon {
            anchors.centerIn: parent
            name: button.symbol
            colour: button.colour
        }
    }
    background: Rectangle {
        radius: Theme.radius
        color: button.down || button.checked ? Theme.selectedInactive : button.hovered ? Theme.hovered : "transparent"
        border.width: button.visualFocus ? 2 : 0
        border.color: Theme.highlight
    }
}
