import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore.Panel

/// A line of a menu: a colour, a text, the keys that do the same, and beneath it why it cannot be done now.
MenuItem {
    id: item

    property string keys: action && action.shortcut ? String(action.shortcut) : ""
    property string reason
    property string description
    property color colour: "transparent"

    readonly property color foreground: !enabled ? Theme.disabledText : highlighted ? Theme.highlightedText : Theme.text

    leftPadding: Theme.margin + Theme.iconSize + Theme.spacing
    rightPadding: Theme.margin
    topPadding: Theme.spacing
    bottomPadding: Theme.spacing

    ToolTip.text: description
    ToolTip.visible: hovered && description !== ""
    ToolTip.delay: 600

    indicator: Text {
        visible: item.checkable && item.checked
        x: Theme.margin
        anchors.verticalCenter: parent.verticalCenter
        text: "✓"
        font: item.font
        color: item.foreground
    }

    contentItem: RowLayout {
        spacing: 6 * Theme.spacing

        ColumnLayout {
            spacing: 0

            Text {
                // "&" stands before the letter that gives the command.
                text: item.text.replace(/</g, "&lt;").replace(/&([^&l]|l(?!t;))/, "<u>$1</u>")
                textFormat: Text.StyledText
                font: item.font
                color: item.foreground
                elide: Text.ElideRight
                Layout.fillWidth: true
            }

            Text {
                text: item.reason
                visible: text !== ""
                font.pixelSize: Math.round(item.font.pixelSize * 0.9)
                color: Theme.secondaryText
                wrapMode: Text.Wrap
                Layout.preferredWidth: Math.min(implicitWidth, 75 * Theme.unit)
            }
        }

        Text {
            text: item.keys
            visible: text !== ""
            font: item.font
            color: item.enabled && item.highlighted ? Theme.highlightedText : Theme.disabledText
        }
    }

    Rectangle {
        visible: item.colour.a > 0
        x: Theme.margin
        anchors.verticalCenter: parent.verticalCenter
        width: Math.round(Theme.iconSize * 0.7)
        height: width
        radius: Theme.radius
        color: item.colour
        opacity: item.enabled ? 1 : 0.4
    }
}
