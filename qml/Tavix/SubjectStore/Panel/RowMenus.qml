import QtQuick

/// The context menus of the list's rows.
Item {
    id: menus

    required property var panel
    required property PanelActions actions

    /// `item` is the row's; nothing when it has none.
    function openFor(row: PanelRow, item: var, x: real, y: real) {
        if (row.isSection) {
            section.key = row.sectionKey
            section.popup(row, x, y)
        } else if (row.isSlot && !row.occupied) {
            slot.slot = item
            slot.popup(row, x, y)
        } else if (row.isSlot || row.isSubject) {
            subject.subject = item.subject
            subject.popup(row, x, y)
        } else if (row.devices.length > 0) {
            cluster.subject = panel.itemOf(row.parentStoreId).subject
            cluster.cluster = row.element
            cluster.pattern = row.patterns.length > 0 ? row.patterns[0] : 0
            cluster.device = row.devices[0]
            cluster.popup(row, x, y)
        }
    }

    SectionContextMenu {
        id: section

        actions: menus.actions
    }

    SubjectContextMenu {
        id: subject

        panel: menus.panel
        actions: menus.actions
    }

    SlotContextMenu {
        id: slot

        panel: menus.panel
        actions: menus.actions
    }

    ClusterContextMenu {
        id: cluster

        panel: menus.panel
        actions: menus.actions
    }
}
