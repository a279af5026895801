import QtQuick
import Tavix.SubjectStore

/// The panel's selection seen from the list: which rows are selected, and what clicks and keys make of it.
QtObject {
    id: selection

    required property var panel
    /// The row from which Shift extends.
    property int anchor: -1

    readonly property var rows: panel ? panel.rows : null
    readonly property var keys: {
        const made = new Set()
        if (panel)
            for (const item of panel.selection)
                made.add(key(item))
        return made
    }

    property Connections following: Connections {
        target: selection.rows

        function onRowsInserted(parent, first, last) {
            if (selection.anchor >= first)
                selection.anchor += last - first + 1
        }

        function onRowsRemoved(parent, first, last) {
            if (selection.anchor > last)
                selection.anchor -= last - first + 1
            else if (selection.anchor >= first)
                selection.anchor = -1
        }

        function onModelReset() {
            selection.anchor = -1
        }
    }

    function key(item: var): string {
        return item && item.subject ? item.subject.toString() + ":" + item.slot + ":" + item.device : ""
    }

    function holds(item: var): bool {
        return item ? keys.has(key(item)) : false
    }

    /// Nothing for rows that cannot be selected: sections and elements. What a delegate has of the model is a view of the
    /// row, and shows another subject once the delegate shows another row; this is a copy, to be kept.
    function itemAt(row: int): var {
        return row < 0 || !rows ? undefined : rows.data(rows.index(row, 0), SubjectsModelRole.SubjectSelectionItem)
    }

    function only(row: int) {
        const item = itemAt(row)
        anchor = row
        panel.select(item ? [item] : [])
    }

    function toggle(row: int) {
        const item = itemAt(row)
        if (!item)
            return
        anchor = row
        const rest = panel.selection.filter(other => !other.equals(item))
        panel.select(rest.length < panel.selection.length ? rest : rest.concat([item]))
    }

    /// From the anchor to a row; beside what is selected already, or instead of it.
    function extend(row: int, keep: bool) {
        const from = anchor < 0 ? row : anchor
        const seen = new Set()
        const items = []
        const add = item => {
            if (!item || seen.has(key(item)))
                return
            seen.add(key(item))
            items.push(item)
        }
        if (keep)
            panel.selection.forEach(add)
        const step = row < from ? -1 : 1
        for (let at = from; at !== row + step; at += step)
            add(itemAt(at))
        anchor = from
        panel.select(items)
    }

    function all() {
        const subjects = rows.subjectsBetween(0, rows.rowCount() - 1)
        panel.select(subjects.map(subject => panel.itemOf(subject)))
    }

    function none() {
        panel.select([])
    }
}
