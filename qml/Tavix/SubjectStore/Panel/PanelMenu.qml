import QtQuick
import QtQuick.Controls

/// A menu in the panel's colours, as wide as its longest line. It says of a command that cannot be given what is
/// missing.
Menu {
    id: menu

    /// What had the focus, and gets it back unless a command has given it to something else.
    property Item before

    function giveBackFocus() {
        const window = parent ? parent.Window : null
        if (before && window && (!window.activeFocusItem || window.activeFocusItem === window.contentItem))
            before.forceActiveFocus()
        before = null
    }

    function fit() {
        let widest = 12 * Theme.rowHeight / 2
        for (let place = 0; place < count; ++place)
            widest = Math.max(widest, itemAt(place).implicitWidth)
        width = Math.min(widest, 20 * Theme.rowHeight) + leftPadding + rightPadding
    }

    padding: 2
    delegate: PanelMenuItem {}
    onAboutToShow: {
        fit()
        // A submenu gives it back to its menu by itself.
        before = parent instanceof MenuItem ? null : parent.Window.activeFocusItem
    }
    onClosed: giveBackFocus()
    background: Rectangle {
        color: Theme.raised
        border.color: Theme.line
        radius: Theme.radius
    }

    // qmllint disable deferred-property-id
    contentItem: ListView {
        id: lines

        implicitHeight: contentHeight
        model: menu.contentModel
        interactive: contentHeight > height
        clip: true
        currentIndex: menu.currentIndex
        ScrollBar.vertical: ScrollBar {}

        HoverHandler {
            id: hover

            readonly property MenuItem line: hovered ? lines.itemAt(point.position.x, point.position.y + lines.contentY) as MenuItem : null
            readonly property PanelAction command: line ? line.action as PanelAction : null
            readonly property string hint: command ? command.hint : ""
        }

        Tip {
            x: lines.width
            y: hover.line ? hover.line.y - lines.contentY : 0
            visible: menu.visible && hover.hint !== ""
            text: hover.hint
        }
    }
}
