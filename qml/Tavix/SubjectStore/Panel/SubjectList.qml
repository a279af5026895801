import QtQml
import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore

/// The subjects by kind, and beneath each what it is made of.
ListView {
    id: list

    required property var panel
    required property PanelActions actions

    readonly property var rows: panel ? panel.rows : null
    readonly property bool focused: activeFocus
    /// The id in words of the subject that is being renamed.
    property string renaming
    property var renamed
    /// Where that is done; null once its row has gone, and with it the wish.
    property Item renameField
    /// A folded row over which something is dragged; -1 for none.
    property int springRow: -1
    /// Where the list scrolls to while something is dragged along its edge.
    property int edge: 0
    /// A subject to bring into view as soon as it has a row.
    property var awaited

    /// What is to be shown is left out by the search or the filter.
    signal filterInTheWay
    signal warningsWanted(Item badge, var warnings)

    function reveal(subject: var) {
        if (!rows || show(subject))
            return
        awaited = subject
        if (rows.search !== "" || rows.onlyWarnings)
            filterInTheWay()
    }

    function show(subject: var): bool {
        const row = rows.rowOfSubject(subject)
        if (row < 0)
            return false
        awaited = undefined
        currentIndex = row
        rowSelection.anchor = row
        positionViewAtIndex(row, ListView.Contain)
        return true
    }

    function startRename() {
        if (actions.ids.length !== 1)
            return
        reveal(actions.ids[0])
        const line = currentItem as PanelRow
        if (line && line.isSubject)
            beginRename(actions.ids[0])
    }

    function beginRename(subject: var) {
        renamed = subject
        renaming = subject.toString()
    }

    /// Moves the current row there, and the selection with it as the modifiers ask.
    function moveTo(row: int, modifiers: int) {
        if (count === 0)
            return
        currentIndex = Math.max(0, Math.min(count - 1, row))
        if (modifiers & Qt.ShiftModifier)
            rowSelection.extend(currentIndex, (modifiers & Qt.ControlModifier) !== 0)
        else if (!(modifiers & Qt.ControlModifier))
            rowSelection.only(currentIndex)
    }

    function press(row: int, modifiers: int) {
        forceActiveFocus()
        if (modifiers & Qt.ControlModifier && !(modifiers & Qt.ShiftModifier)) {
            currentIndex = row
            rowSelection.toggle(row)
        } else {
            moveTo(row, modifiers)
        }
    }

    /// A row that is not selected becomes the selection before its menu opens.
    function openMenu(row: int, x: real, y: real) {
        const line = itemAtIndex(row) as PanelRow
        if (!line)
            return
        forceActiveFocus()
        currentIndex = row
        if (line.item && !line.selected)
            rowSelection.only(row)
        actions.dialogs.near(line, x, y)
        menus.openFor(line, rowSelection.itemAt(row), x, y)
    }

    function foldOrLeave() {
        const line = currentItem as PanelRow
        if (!line)
            return
        if (line.expandable && line.expanded)
            rows.setExpanded(currentIndex, false)
        else if (line.depth > 0)
            moveTo(line.depth > 1 ? rows.rowOfSubject(line.parentStoreId) : rows.rowOfSection(line.sectionKey), Qt.NoModifier)
    }

    function unfoldOrEnter() {
        const line = currentItem as PanelRow
        if (!line || !line.expandable)
            return
        if (!line.expanded)
            rows.setExpanded(currentIndex, true)
        else if (line.count > 0)
            moveTo(currentIndex + 1, Qt.NoModifier)
    }

    /// How far a key moves the current row; 0 for none.
    function stepOf(key: int): int {
        const page = Math.max(1, Math.floor(height / Theme.rowHeight) - 1)
        switch (key) {
        case Qt.Key_Up:
            return -1
        case Qt.Key_Down:
            return 1
        case Qt.Key_PageUp:
            return -page
        case Qt.Key_PageDown:
            return page
        case Qt.Key_Home:
            return -count
        case Qt.Key_End:
            return count
        }
        return 0
    }

    function key(event: var): bool {
        const step = stepOf(event.key)
        if (step !== 0)
            moveTo(currentIndex + step, event.modifiers)
        else if (event.key === Qt.Key_Left)
            foldOrLeave()
        else if (event.key === Qt.Key_Right)
            unfoldOrEnter()
        else if (event.key === Qt.Key_A && event.modifiers & Qt.ControlModifier)
            rowSelection.all()
        else if (event.key === Qt.Key_Space && event.modifiers & Qt.ControlModifier)
            rowSelection.toggle(currentIndex)
        else if (event.key === Qt.Key_Menu || (event.key === Qt.Key_F10 && event.modifiers & Qt.ShiftModifier))
            openMenu(currentIndex, 4 * Theme.margin, Theme.rowHeight)
        else if (event.key === Qt.Key_Escape && slotDrag.active)
            slotDrag.cancel()
        else if (event.key === Qt.Key_Escape)
            rowSelection.none()
        else
            return false
        return true
    }

    function dragTo(point: point) {
        slotDrag.position = point
        const line = contains(point) ? itemAt(point.x + contentX, point.y + contentY) as PanelRow : null
        slotDrag.target = line && line.droppable ? rowSelection.itemAt(line.index) : undefined
        springRow = line && line.isSubject && line.expandable && !line.expanded ? line.index : -1
        edge = point.y < Theme.rowHeight ? -1 : point.y > height - Theme.rowHeight ? 1 : 0
    }

    model: rows
    clip: true
    focus: true
    reuseItems: true
    keyNavigationEnabled: false
    highlightFollowsCurrentItem: true
    highlightMoveDuration: 0
    highlightResizeDuration: 0
    boundsBehavior: Flickable.StopAtBounds
    pixelAligned: true
    activeFocusOnTab: true
    Keys.onPressed: event => event.accepted = list.key(event)
    Accessible.role: Accessible.Tree
    Accessible.name: qsTr("Subjects")

    ScrollBar.vertical: ScrollBar {
        id: bar

        policy: size < 1 ? ScrollBar.AlwaysOn : ScrollBar.AlwaysOff
        minimumSize: 0.06
        contentItem: Rectangle {
            implicitWidth: 2 * Theme.unit
            radius: width / 2
            color: bar.pressed || bar.hovered ? Theme.secondaryText : Theme.line
        }
        background: null
    }

    // qmllint disable unqualified
    delegate: PanelRow {
        width: list.width - (bar.size < 1 ? bar.width : 0)
        panel: list.panel
        selection: rowSelection
        drag: slotDrag
        current: ListView.isCurrentItem
        focused: list.focused
        renamedSubject: list.renaming
        nameProblem: text => list.panel.nameProblem(text, list.renamed)
        onPressed: modifiers => list.press(index, modifiers)
        onToggled: list.rows.toggle(index)
        onEnabledToggled: list.actions.tell(SubjectStore.setSubjectsEnabled(selected ? list.actions.ids : [subjectStoreId], !subjectEnabled))
        onMenuWanted: (x, y) => list.openMenu(index, x, y)
        onWarningsWanted: (badge, warnings) => list.warningsWanted(badge, warnings)
        onRenameShown: field => list.renameField = field
        onRenamed: text => list.actions.tell(SubjectStore.setSubjectName(list.renamed, text))
        ListView.onPooled: pooled = true
        ListView.onReused: pooled = false
        onRenameLeft: {
            list.renaming = ""
            forceActiveFocus()
        }
        // The list keeps the item of its current row, also when that is scrolled away under the pointer.
        onDragStarted: list.currentIndex = index
        onDragMoved: scene => list.dragTo(list.mapFromItem(null, scene.x, scene.y))
    }
    // qmllint enable unqualified

    RowSelection {
        id: rowSelection

        panel: list.panel
    }

    SlotDrag {
        id: slotDrag

        panel: list.panel
        onFinished: (subject, slot) => list.actions.tell(SubjectStore.assignSubjectToSlot(subject, slot))
        onActiveChanged: {
            list.springRow = -1
            list.edge = 0
        }
    }

    DragGhost {
        parent: list
        z: 10
        drag: slotDrag
    }

    RowMenus {
        id: menus

        panel: list.panel
        actions: list.actions
    }

    Instantiator {
        model: list.actions.ofList

        // qmllint disable unqualified
        Shortcut {
            required property PanelAction modelData

            sequence: modelData.keys
            enabled: list.activeFocus && modelData.enabled
            onActivated: modelData.trigger()
        }
        // qmllint enable unqualified
    }

    Timer {
        // The subject may have gone again: then nobody is to be taken anywhere later.
        running: list.awaited !== undefined
        interval: 3000
        onTriggered: list.awaited = undefined
    }

    Timer {
        // Not at once: when the row has another delegate now, that brings a field of its own.
        running: list.renaming !== "" && list.renameField === null
        interval: 50
        onTriggered: list.renaming = ""
    }

    Timer {
        running: slotDrag.active && list.springRow >= 0
        interval: 600
        onTriggered: list.rows.setExpanded(list.springRow, true)
    }

    Timer {
        running: slotDrag.active && list.edge !== 0
        interval: 40
        repeat: true
        onTriggered: {
            const last = Math.max(list.originY, list.originY + list.contentHeight - list.height)
            list.contentY = Math.max(list.originY, Math.min(last, list.contentY + list.edge * Theme.rowHeight / 2))
            list.dragTo(slotDrag.position)
        }
    }

    Connections {
        target: list.rows

        function onCountsChanged() {
            if (list.awaited)
                list.show(list.awaited)
        }
    }

    Connections {
        target: SubjectStore

        function onFocusSubject(subjectStoreId) {
            list.panel.select([list.panel.itemOf(subjectStoreId)])
            list.reveal(subjectStoreId)
        }
    }

    Connections {
        target: list.actions

        function onRenameWanted() {
            list.startRename()
        }

        function onRevealWanted(subject) {
            list.panel.select([list.panel.itemOf(subject)])
            list.reveal(subject)
        }
    }
}
