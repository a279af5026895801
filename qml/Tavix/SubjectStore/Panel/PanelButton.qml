import QtQuick
import QtQuick.Controls

/// A button of a dialog; the one that Enter stands for is filled.
Button {
    id: button

    implicitHeight: Theme.rowHeight + Theme.unit
    implicitWidth: Math.max(4 * Theme.rowHeight, implicitContentWidth + 4 * Theme.margin)
    Keys.onReturnPressed: clicked()
    Keys.onEnterPressed: clicked()

    contentItem: Text {
        text: button.text
        font: button.font
        color: !button.enabled ? Theme.disabledText : button.highlighted ? Theme.highlightedText : Theme.text
        elide: Text.ElideRight
        horizontalAlignment: Text.AlignHCenter
        verticalAlignment: Text.AlignVCenter
    }
    background: Rectangle {
        readonly property color base: button.highlighted ? Theme.highlight : Theme.raised

        radius: Theme.radius
        color: !button.enabled ? Theme.window : button.down ? Qt.darker(base, 1.2) : button.hovered ? Qt.lighter(base, 1.12) : base
        border.width: button.visualFocus ? 2 : button.highlighted && button.enabled ? 0 : 1
        border.color: button.visualFocus ? Theme.text : Theme.line
    }
}
