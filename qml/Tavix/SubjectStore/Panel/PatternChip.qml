import QtQuick

/// The number of an active marker pattern on its colour; an empty frame for none.
Rectangle {
    id: chip

    property int pattern

    implicitWidth: Math.max(number.implicitWidth + 2 * Theme.unit, implicitHeight * 1.4)
    implicitHeight: Math.round(Theme.iconSize * 1.05)
    radius: Theme.radius
    color: pattern > 0 ? Theme.patternColour(pattern) : "transparent"
    border.color: Theme.disabledText
    border.width: pattern > 0 ? 0 : 1

    Text {
        id: number

        anchors.centerIn: parent
        text: chip.pattern > 0 ? chip.pattern : "–"
        color: chip.pattern <= 0 ? Theme.secondaryText : Theme.dark ? "#16181c" : "#ffffff"
        font.pixelSize: Theme.smallFont
        font.bold: chip.pattern > 0
    }
}
