import QtQuick
import QtQuick.Controls

/// A switch whose state is somebody else's: it moves when that has changed.
Switch {
    id: toggle

    property bool on: false

    signal edited(bool on)

    checked: on
    leftPadding: 0
    rightPadding: 0
    topPadding: Theme.spacing
    bottomPadding: Theme.spacing
    onClicked: {
        const wanted = toggle.checked
        toggle.checked = Qt.binding(() => toggle.on)
        toggle.edited(wanted)
    }
    Keys.onReturnPressed: toggle.edited(!toggle.on)

    indicator: Rectangle {
        y: Math.round((toggle.height - height) / 2)
        width: 2 * height
        height: Theme.iconSize
        radius: height / 2
        color: toggle.checked ? Theme.highlight : Theme.line
        border.width: toggle.visualFocus ? 2 : 1
        border.color: toggle.visualFocus ? Theme.text : toggle.checked ? Theme.highlight : Theme.secondaryText

        Rectangle {
            x: toggle.checked ? parent.width - width - 3 : 3
            y: 3
            width: height
            height: parent.height - 6
            radius: height / 2
            color: toggle.checked ? Theme.highlightedText : Theme.text
        }
    }
    contentItem: Text {
        leftPadding: toggle.indicator.width + 1.5 * Theme.spacing
        text: toggle.text
        font: toggle.font
        color: Theme.text
        elide: Text.ElideRight
        verticalAlignment: Text.AlignVCenter
    }
}
