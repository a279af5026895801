import QtQuick
import QtQuick.Controls

/// A check box with a text that may need more than one line, and a state that is somebody else's.
CheckBox {
    id: box

    property bool on: false

    signal edited(bool on)

    checked: on
    implicitWidth: 30 * Theme.unit
    leftPadding: 0
    topPadding: Theme.spacing
    bottomPadding: Theme.spacing
    onClicked: {
        const wanted = box.checked
        box.checked = Qt.binding(() => box.on)
        box.edited(wanted)
    }

    indicator: Rectangle {
        y: Math.round((box.height - height) / 2)
        width: Theme.iconSize
        height: Theme.iconSize
        radius: Theme.radius
        opacity: box.enabled ? 1 : 0.5
        color: box.checked ? Theme.highlight : Theme.surface
        border.width: box.visualFocus ? 2 : 1
        border.color: box.visualFocus ? Theme.text : box.checked ? Theme.highlight : box.hovered ? Theme.text : Theme.secondaryText

        Icon {
            anchors.fill: parent
            anchors.margins: 1
            visible: box.checked
            name: "check"
            colour: Theme.highlightedText
        }
    }
    contentItem: Text {
        leftPadding: box.indicator.width + 1.5 * Theme.spacing
        text: box.text
        font: box.font
        color: box.enabled ? Theme.text : Theme.disabledText
        wrapMode: Text.Wrap
        verticalAlignment: Text.AlignVCenter
    }
}
