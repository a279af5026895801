import QtQuick
import QtQuick.Controls

/// The sentences behind a warning badge.
Popup {
    id: summary

    property var warnings: []

    function show(badge: Item, sentences: var) {
        warnings = sentences
        const corner = badge.mapToItem(parent, badge.width, badge.height)
        x = Math.max(Theme.unit, corner.x - width)
        open()
        y = corner.y + height > parent.height ? Math.max(0, corner.y - badge.height - height) : corner.y
    }

    parent: Overlay.overlay
    width: Math.min(24 * Theme.rowHeight / 1.6, parent ? parent.width - 2 * Theme.margin : 0)
    padding: Theme.margin
    focus: true

    background: Rectangle {
        color: Theme.raised
        border.color: Theme.line
        radius: Theme.radius
    }
    // qmllint disable deferred-property-id
    contentItem: Column {
        spacing: Theme.spacing

        Repeater {
            model: summary.warnings

            Row {
                id: line

                required property var modelData

                width: parent.width
                spacing: Theme.margin

                Icon {
                    id: icon

                    name: "warning"
                    colour: Theme.warning
                }

                Text {
                    width: line.width - icon.width - line.spacing
                    text: line.modelData.text
                    wrapMode: Text.Wrap
                    color: Theme.text
                    textFormat: Text.PlainText
                    Accessible.role: Accessible.ListItem
                    Accessible.name: text
                }
            }
        }
    }
}
