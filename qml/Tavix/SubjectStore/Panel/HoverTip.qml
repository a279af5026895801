import QtQuick

/// Gives its parent a tooltip, which is only made when the mouse is there: rows have many.
Item {
    id: area

    property string text
    property bool offered: true

    readonly property alias hovered: hover.hovered

    anchors.fill: parent

    HoverHandler {
        id: hover
    }

    Loader {
        active: hover.hovered && area.offered && area.text !== ""
        // qmllint disable unqualified
        sourceComponent: Tip {
            parent: area
            y: area.height + Theme.unit
            visible: true
            text: area.text
        }
        // qmllint enable unqualified
    }
}
