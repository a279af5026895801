import QtQuick

/// What follows the pointer while an object is dragged, and says whether it can be dropped there.
Rectangle {
    id: ghost

    required property SlotDrag drag

    visible: drag.active
    x: Math.max(0, Math.min(drag.position.x + 2 * Theme.unit, parent.width - width))
    y: Math.max(0, Math.min(drag.position.y + Theme.unit, parent.height - height))
    implicitWidth: content.implicitWidth + 2 * Theme.margin
    implicitHeight: content.implicitHeight + Theme.margin
    radius: Theme.radius
    color: Theme.raised
    border.color: drag.target ? Theme.good : Theme.line

    Row {
        id: content

        anchors.centerIn: parent
        spacing: Theme.spacing

        ColourSwatch {
            anchors.verticalCenter: parent.verticalCenter
            colour: ghost.drag.colour
        }

        Text {
            text: ghost.drag.possible ? ghost.drag.name : qsTr("%1: no slot takes it").arg(ghost.drag.name)
            color: Theme.text
            textFormat: Text.PlainText
        }
    }
}
