import QtQuick
import QtQuick.Controls

/// A menu's line: text, and at its end the keys of the command.
MenuItem {
    id: item

    /// Whether the menu has it at all; a submenu that cannot be opened is left out.
    property bool offered: subMenu === null || subMenu.enabled

    readonly property PanelAction command: action as PanelAction
    readonly property color colour: enabled ? Theme.text : Theme.disabledText
    readonly property real markWidth: Theme.iconSize + Theme.margin

    implicitWidth: markWidth + label.implicitWidth + keys.implicitWidth + 4 * Theme.margin + Theme.iconSize
    implicitHeight: Theme.rowHeight + Theme.unit / 2
    visible: offered
    height: offered ? implicitHeight : 0
    Accessible.name: label.text

    arrow: Icon {
        x: item.width - width - Theme.unit
        anchors.verticalCenter: parent ? parent.verticalCenter : undefined
        visible: item.subMenu !== null
        name: "arrow"
        colour: item.colour
    }
    indicator: Item {
        x: Theme.unit
        width: item.markWidth - Theme.unit
        height: item.height

        Icon {
            anchors.verticalCenter: parent.verticalCenter
            visible: item.checked
            name: "check"
            colour: item.colour
        }
    }
    // qmllint disable deferred-property-id
    contentItem: Item {
        Text {
            id: label

            x: item.markWidth
            anchors.verticalCenter: parent.verticalCenter
            width: Math.min(implicitWidth, item.width - x - keys.width - 2 * Theme.margin - Theme.iconSize)
            text: item.text
            elide: Text.ElideRight
            color: item.colour
            font: item.font
            textFormat: Text.PlainText
        }

        Text {
            id: keys

            anchors.right: parent.right
            anchors.rightMargin: Theme.margin
            anchors.verticalCenter: parent.verticalCenter
            text: item.command ? item.command.keys : ""
            color: item.enabled ? Theme.secondaryText : Theme.disabledText
            font.pixelSize: Theme.smallFont
        }
    }
    background: Rectangle {
        x: 2
        width: item.width - 4
        height: item.height
        radius: Theme.radius
        color: item.highlighted && item.enabled ? Theme.selected : "transparent"
    }
    leftPadding: 0
    rightPadding: 0
    topPadding: 0
    bottomPadding: 0
}
