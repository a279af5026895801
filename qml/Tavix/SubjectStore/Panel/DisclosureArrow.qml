import QtQuick

/// Shows whether a row is folded, and folds it.
Item {
    id: arrow

    required property var row

    implicitWidth: Theme.iconSize
    implicitHeight: Theme.rowHeight

    Icon {
        anchors.centerIn: parent
        visible: arrow.row.expandable
        name: "arrow"
        colour: hover.hovered ? Theme.text : Theme.secondaryText
        rotation: arrow.row.expanded ? 90 : 0
    }

    HoverHandler {
        id: hover
    }

    TapHandler {
        enabled: arrow.row.expandable
        gesturePolicy: TapHandler.WithinBounds
        onTapped: arrow.row.toggled()
    }
}
