import QtQuick

/// A dot with a word beside it.
Row {
    id: status

    property alias text: label.text
    property color colour: Theme.secondaryText
    property bool hollow

    spacing: Theme.spacing

    Rectangle {
        anchors.verticalCenter: parent.verticalCenter
        width: Math.round(Theme.iconSize / 2)
        height: width
        radius: width / 2
        color: status.hollow ? "transparent" : status.colour
        border.color: status.colour
        border.width: Math.max(1, width / 6)
    }

    Text {
        id: label

        anchors.verticalCenter: parent.verticalCenter
        color: Theme.secondaryText
        font.pixelSize: Theme.smallFont
    }
}
