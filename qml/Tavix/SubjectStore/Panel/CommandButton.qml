import QtQuick
import QtQuick.Controls

/// A button for a command. While that is not possible, it says why.
Item {
    id: command

    property Action action
    /// Why the command is not possible; empty when it is.
    property string reason
    property string toolTip
    /// The command that comes next.
    property bool primary: false

    implicitWidth: button.implicitWidth
    implicitHeight: button.implicitHeight

    Button {
        id: button

        anchors.fill: parent
        action: command.action
        highlighted: command.primary && enabled
        implicitHeight: Theme.rowHeight + Theme.unit
        leftPadding: 2 * Theme.margin
        rightPadding: 2 * Theme.margin
        Accessible.description: command.reason || command.toolTip
        Keys.onReturnPressed: command.action.trigger()
        Keys.onEnterPressed: command.action.trigger()

        contentItem: Text {
            text: button.text
            font: button.font
            color: !button.enabled ? Theme.disabledText : button.highlighted ? Theme.highlightedText : Theme.text
            elide: Text.ElideRight
            horizontalAlignment: Text.AlignHCenter
            verticalAlignment: Text.AlignVCenter
        }
        background: Rectangle {
            radius: Theme.radius
            color: {
                if (!button.enabled)
                    return Theme.window
                if (button.highlighted)
                    return button.down ? Qt.darker(Theme.highlight, 1.2) : button.hovered ? Qt.lighter(Theme.highlight, 1.1) : Theme.highlight
                return button.down ? Theme.line : button.hovered ? Theme.hovered : Theme.raised
            }
            border.width: button.highlighted && !button.visualFocus ? 0 : 1
            border.color: button.visualFocus && !button.highlighted ? Theme.highlight : Theme.line

            Rectangle {
                anchors.fill: parent
                anchors.margins: button.highlighted ? 2 : 0
                visible: button.visualFocus
                radius: parent.radius
                color: "transparent"
                border.width: button.highlighted ? 1 : 2
                border.color: button.highlighted ? Theme.highlightedText : Theme.highlight
            }
        }
    }
    // Not of the button: a disabled item is not told of the mouse.
    HoverHandler {
        id: hover
    }
    Tip {
        visible: hover.hovered && text !== ""
        text: command.reason || command.toolTip
    }
}
