import QtQuick
import QtQuick.Controls
import QtQuick.Window

/// A pane whose content is a column that scrolls when it is too tall.
ScrollView {
    id: pane

    default property alias content: column.data
    /// While this is not empty, it stands in place of the content.
    property string emptyTitle
    property string emptyText
    readonly property Flickable view: contentItem as Flickable
    readonly property Item focused: Window.activeFocusItem

    /// Scrolls as far as needed for the item to show; not for a tall one of which a part shows already.
    function reveal(item: Item) {
        const top = item.mapToItem(column, 0, 0).y + column.y
        const bottom = top + item.height
        const first = pane.view.contentY
        const last = first + pane.height
        if (item.height > pane.height / 2 && bottom > first && top < last)
            return
        if (top < first + Theme.margin)
            pane.view.contentY = Math.max(0, top - Theme.margin)
        else if (bottom > last - Theme.margin)
            pane.view.contentY = Math.min(pane.contentHeight - pane.height, bottom + Theme.margin - pane.height)
    }

    onFocusedChanged: {
        for (let ancestor = focused; ancestor; ancestor = ancestor.parent) {
            if (ancestor === column)
                return reveal(focused)
        }
    }
    contentWidth: availableWidth
    contentHeight: column.implicitHeight + 2 * Theme.margin
    ScrollBar.horizontal.policy: ScrollBar.AlwaysOff

    Item {
        width: pane.availableWidth
        implicitHeight: column.implicitHeight + 2 * Theme.margin

        // Not a layout: nested layouts do not follow heights that depend on widths.
        Column {
            id: column

            x: Theme.margin
            y: Theme.margin
            // The scroll bar has its room also while there is none: what is lower when it is narrower, such as a
            // picture, would bring the bar and take it away without end.
            width: parent.width - 3 * Theme.margin
            visible: pane.emptyTitle === ""
            spacing: Theme.margin
        }
        EmptyPane {
            visible: pane.emptyTitle !== ""
            title: pane.emptyTitle
            text: pane.emptyText
        }
    }
}
