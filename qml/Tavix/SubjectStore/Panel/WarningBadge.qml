import QtQuick
import QtQuick.Controls

/// Says that there are warnings, and how many; a click asks for them.
AbstractButton {
    id: badge

    property int count
    property string tip
    /// Who has clicked sees the warnings already.
    property bool clickedOn

    visible: count > 0
    implicitWidth: implicitContentWidth + Theme.unit
    implicitHeight: Theme.iconSize + Theme.unit
    focusPolicy: Qt.NoFocus
    hoverEnabled: true
    Accessible.name: qsTr("%n warning(s)", "", count)

    contentItem: Row {
        spacing: Theme.unit / 2
        leftPadding: Theme.unit / 2

        Icon {
            anchors.verticalCenter: parent.verticalCenter
            name: "warning"
            colour: Theme.warning
        }

        Text {
            anchors.verticalCenter: parent.verticalCenter
            visible: badge.count > 1
            text: badge.count
            color: Theme.warning
            font.pixelSize: Theme.smallFont
            font.bold: true
        }
    }
    onPressed: clickedOn = true
    onHoveredChanged: {
        if (!hovered)
            clickedOn = false
    }

    HoverTip {
        text: badge.tip
        offered: !badge.clickedOn
    }

    background: Rectangle {
        radius: Theme.radius
        color: badge.hovered ? Qt.alpha(Theme.warning, 0.18) : "transparent"
    }
}
