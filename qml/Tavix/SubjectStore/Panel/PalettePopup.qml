import QtQuick
import QtQuick.Controls

/// A grid of choices to pick one from by mouse, or by arrow keys and Enter.
Popup {
    id: popup

    property var choices: []
    property int columns: 6
    property string title
    property alias cell: grid.delegate
    property alias current: grid.currentIndex

    /// What had the focus, and gets it back.
    property Item before

    signal picked(var choice)

    function pick(place: int) {
        if (place < 0 || place >= choices.length)
            return
        picked(choices[place])
        close()
    }

    /// Opens with its corner at a point of an item, inside the window, once the menu that asks has closed.
    function openAt(item: Item, x: real, y: real) {
        const point = item.mapToItem(parent, x, y)
        popup.x = Math.max(0, Math.min(point.x, parent.width - width))
        popup.y = Math.max(0, Math.min(point.y, parent.height - height))
        Qt.callLater(popup.open) // qmllint disable
    }

    parent: Overlay.overlay
    modal: true
    dim: false
    focus: true
    padding: Theme.margin
    onAboutToShow: before = parent.Window.activeFocusItem
    onOpened: grid.forceActiveFocus()
    onClosed: {
        if (before)
            before.forceActiveFocus()
    }

    background: Rectangle {
        color: Theme.raised
        border.color: Theme.line
        radius: Theme.radius
    }
    // qmllint disable deferred-property-id
    contentItem: Column {
        spacing: Theme.spacing

        Text {
            text: popup.title
            color: Theme.secondaryText
        }

        GridView {
            id: grid

            width: popup.columns * cellWidth
            height: Math.ceil(popup.choices.length / popup.columns) * cellHeight
            cellWidth: Theme.cellSize
            cellHeight: Theme.cellSize
            interactive: false
            model: popup.choices
            keyNavigationEnabled: true
            Keys.onReturnPressed: popup.pick(currentIndex)
            Keys.onEnterPressed: popup.pick(currentIndex)
            Keys.onSpacePressed: popup.pick(currentIndex)
            highlight: Rectangle {
                color: "transparent"
                radius: Theme.radius
                border.color: Theme.highlight
                border.width: 2
            }
            highlightMoveDuration: 0

            TapHandler {
                // Grabs the press, which would reach the rows beneath otherwise.
                gesturePolicy: TapHandler.ReleaseWithinBounds
                onTapped: eventPoint => popup.pick(grid.indexAt(eventPoint.position.x, eventPoint.position.y))
            }

            HoverHandler {
                onPointChanged: {
                    const place = grid.indexAt(point.position.x, point.position.y)
                    if (place >= 0)
                        grid.currentIndex = place
                }
            }
        }
    }
}
