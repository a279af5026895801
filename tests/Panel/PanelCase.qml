import QtQuick
import QtQuick.Controls
import QtTest
import Tavix.SubjectStore
import Tavix.SubjectStore.Panel

/// A test of the panel: an empty stage before each function, and the ways in which an operator finds things by what
/// they are called. A warning fails the test.
TestCase {
    id: test

    property alias view: subject
    readonly property var panel: subject.panel
    readonly property var rows: panel.rows
    /// What a command says of a subject that a client has removed.
    readonly property string notThere: "It is no longer there."
    readonly property Item list: find(item => item.reveal !== undefined && item.rows !== undefined, subject)

    when: windowShown
    visible: true
    width: 1100
    height: 760

    SubjectPanel {
        id: subject

        anchors.fill: parent
    }

    function init() {
        failOnWarning(/.?/)
        stage.clear()
        panel.select([])
        rows.search = ""
        rows.onlyWarnings = false
        const message = find(item => item.Accessible.role === Accessible.AlertMessage && item.clear !== undefined)
        if (message)
            message.clear()
        tryVerify(() => rows.totalCount === 0)
        mouseMove(subject, 1, 1)
        list.forceActiveFocus()
    }

    /// The first visible item beneath `root` that is accepted; of popups too when `root` is left out.
    function find(accept: var, root: var): Item {
        const top = root ?? subject.Window.contentItem
        if (!top.visible)
            return null
        for (let i = top.children.length - 1; i >= 0; --i) {
            const found = find(accept, top.children[i])
            if (found)
                return found
        }
        return accept(top) ? top : null
    }

    /// Waits for what has that text; buttons, menu lines, labels.
    function byText(text: string): Item {
        let found = null
        tryVerify(() => (found = find(item => item.text === text && item.width > 0 && item.height > 0)) !== null, 3000, text)
        return found
    }

    /// Waits for what has that accessible name.
    function byName(name: string): Item {
        let found = null
        tryVerify(() => (found = find(item => item.Accessible.name === name && item.width > 0)) !== null, 3000, name)
        return found
    }

    function gone(text: string): bool {
        return find(item => item.text === text && item.width > 0 && item.height > 0) === null
    }

    function press(item: Item, button: var, modifiers: var) {
        mouseClick(item, item.width / 2, item.height / 2, button ?? Qt.LeftButton, modifiers ?? Qt.NoModifier)
    }

    function add(kind: string, ...names) {
        names.forEach(name => verify(stage.add(kind, name)))
    }

    function idOf(name: string): var {
        return SubjectStore.subjects().find(id => SubjectStore.subjectName(id) === name)
    }

    function sectionOf(key: string): Item {
        let row = null
        tryVerify(() => (row = list.itemAtIndex(rows.rowOfSection(key))) !== null)
        return row
    }

    /// The row of a subject, in view.
    function rowOf(name: string): Item {
        let found = null
        tryVerify(() => {
            const id = idOf(name)
            const row = id ? rows.rowOfSubject(id) : -1
            if (row < 0)
                return false
            list.positionViewAtIndex(row, ListView.Contain)
            found = list.itemAtIndex(row)
            return found !== null && found.subjectName === name
        }, 3000, "row of " + name)
        return found
    }

    /// The row beneath a subject whose slot, or element, has that name.
    function rowBeneath(name: string, beneath: string): Item {
        rowOf(name)
        const row = rows.rowOfSubject(idOf(name))
        rows.setExpanded(row, true)
        let found = null
        tryVerify(() => {
            for (let i = row + 1; i < list.count; ++i) {
                list.positionViewAtIndex(i, ListView.Contain)
                const item = list.itemAtIndex(i)
                if (!item || item.depth < 2)
                    return false
                if (item.slotName === beneath || item.subjectName === beneath) {
                    found = item
                    return true
                }
            }
            return false
        }, 3000, beneath + " beneath " + name)
        return found
    }

    /// Clicks rows of subjects: the first alone, the others in addition.
    function select(...names) {
        names.forEach((name, i) => press(rowOf(name), Qt.LeftButton, i === 0 ? Qt.NoModifier : Qt.ControlModifier))
        compare(panel.selectedSubjects.length, names.length)
    }

    /// Opens the row's menu as far as a submenu, and waits for a line of it.
    function openMenu(row: Item, ...texts): Item {
        press(row, Qt.RightButton)
        let line = null
        texts.forEach((text, i) => {
            tryVerify(() => (line = lineOf(text)) !== null, 3000, text)
            settle(line)
            if (i < texts.length - 1)
                press(line)
        })
        return line
    }

    /// Leaves the menu with all that it has opened.
    function leaveMenu() {
        tryVerify(() => {
            if (find(item => item.subMenu !== undefined && item.height > 0) === null)
                return true
            keyClick(Qt.Key_Escape)
            return false
        })
    }

    /// The line of an open menu.
    function lineOf(text: string): Item {
        return find(item => item.subMenu !== undefined && item.text === text && item.height > 0)
    }

    /// Opens the row's menu and goes through it to a command.
    function choose(row: Item, ...texts) {
        press(row, Qt.RightButton)
        follow(...texts)
    }

    /// Goes through an open menu to a command.
    function follow(...texts) {
        for (const text of texts) {
            let line = null
            tryVerify(() => (line = lineOf(text)) !== null, 3000, text)
            verify(line.enabled, text + " is enabled")
            settle(line)
            press(line)
        }
        tryVerify(() => lineOf(texts[0]) === null, 3000, "the menu closes")
    }

    /// Waits for a palette; its grid.
    function openPalette(): Item {
        let grid = null
        tryVerify(() => (grid = find(item => item.cellWidth !== undefined)) !== null, 3000, "a palette opens")
        settle(grid)
        return grid
    }

    function type(text: string) {
        for (const letter of text)
            keyClick(letter)
    }

    /// Shows a page of the inspector.
    function showPage(name: string) {
        const inspector = find(item => item.pages !== undefined && item.show !== undefined)
        inspector.show(name)
    }

    function checkBox(text: string): Item {
        return find(item => item.checkState !== undefined && item.text === text)
    }

    function button(text: string): Item {
        let found = null
        tryVerify(() => (found = find(item => item.display !== undefined && item.text === text)) !== null, 3000, text)
        return found
    }

    /// The button cannot be pressed, and says why to who points at it.
    function verifyRefused(refused: Item, reason: string) {
        tryCompare(refused, "enabled", false)
        settle(refused)
        let at = 2
        tryVerify(() => {
            mouseMove(refused, at = 7 - at, 5) // a dialog that has just opened misses the first
            return !gone(reason)
        }, 3000, reason)
        mouseMove(test.view, 1, 1)
    }

    /// Waits until an item is laid out, with all that it is in, and moved no more.
    function settle(item: Item) {
        let before = Qt.point(NaN, NaN)
        tryVerify(() => {
            const last = before
            before = item.mapToItem(test.view, 0, 0)
            return before.x === last.x && before.y === last.y && isLaidOut(item)
        }, 5000, "it is moved no more")
    }

    function isLaidOut(item: Item): bool {
        return item === null || (!isPolishScheduled(item) && isLaidOut(item.parent))
    }

    /// Clicks an editor; the pane scrolls to what has the focus.
    function enter(item: Item) {
        settle(item)
        item.forceActiveFocus(Qt.TabFocusReason)
        settle(item)
        press(item)
    }

    /// Types in place of what an editor holds.
    function fill(item: Item, text: string) {
        enter(item)
        keyClick(Qt.Key_A, Qt.ControlModifier)
        type(text)
    }

    function pick(box: Item, text: string) {
        enter(box)
        let line = null
        tryVerify(() => box.popup.opened && (line = find(item => item.text === text, box.popup.contentItem)) !== null, 3000, text)
        press(line)
        tryVerify(() => !box.popup.visible)
    }
}
