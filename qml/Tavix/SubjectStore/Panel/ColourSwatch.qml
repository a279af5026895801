import QtQuick

/// The colour of a subject; an empty frame when it has none.
Rectangle {
    property string colour

    implicitWidth: Math.round(Theme.iconSize * 0.7)
    implicitHeight: implicitWidth
    radius: Theme.radius
    color: colour !== "" ? colour : "transparent"
    border.color: colour !== "" ? Qt.darker(color, 1.3) : Theme.disabledText
}
