import QtQuick
import QtQuick.Controls

/// A small flat button that shows a sign and tells its text.
AbstractButton {
    id: button

    property string glyph

    implicitWidth: Theme.rowHeight
    implicitHeight: Theme.rowHeight
    focusPolicy: Qt.StrongFocus
    Accessible.name: text
    Keys.onReturnPressed: button.clicked()
    Keys.onEnterPressed: button.clicked()

    contentItem: Text {
        text: button.glyph
        color: button.enabled ? Theme.text : Theme.disabledText
        font.pixelSize: Math.round(Theme.iconSize)
        horizontalAlignment: Text.AlignHCenter
        verticalAlignment: Text.AlignVCenter
    }
    background: Rectangle {
        radius: Theme.radius
        color: button.down ? Theme.line : button.hovered ? Theme.hovered : "transparent"
        border.width: button.visualFocus ? 2 : 0
        border.color: Theme.highlight
    }

    Tip {
        visible: button.hovered && button.enabled
        text: button.text
    }
}
