import QtQuick
import QtQuick.Controls

/// A text field that is marked while what it holds is refused.
TextField {
    id: field

    /// Why the text is refused; empty when it is not.
    property string problem

    selectByMouse: true
    color: Theme.text
    placeholderTextColor: Theme.secondaryText
    selectionColor: Theme.highlight
    selectedTextColor: Theme.highlightedText
    topPadding: Theme.unit / 2
    bottomPadding: Theme.unit / 2
    leftPadding: Theme.unit
    rightPadding: Theme.unit
    Accessible.description: problem

    background: Rectangle {
        implicitHeight: Theme.rowHeight
        radius: Theme.radius
        color: Theme.surface
        border.width: field.activeFocus || field.problem !== "" ? 2 : 1
        border.color: field.problem !== "" ? Theme.critical : field.activeFocus ? Theme.highlight : Theme.line
    }
}
