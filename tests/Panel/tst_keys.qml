import QtQuick
import QtTest
import Tavix.SubjectStore

/// The panel without a mouse, and how it brings subjects into view.
PanelCase {
    id: test

    name: "Keys"

    readonly property Item focused: view.Window.activeFocusItem

    function within(root: var): bool {
        for (let item = focused; item; item = item.parent)
            if (item === root)
                return true
        return false
    }

    function selectedNames(): string {
        return panel.selectedSubjects.map(id => SubjectStore.subjectName(id)).join()
    }

    function prepare() {
        for (const name of ["A", "B", "C"])
            stage.add("BasicObjects", name)
        stage.setMarkers("B", [[0, 0, 0], [100, 0, 0]])
        rowOf("C")
        rows.setExpanded(rows.rowOfSubject(idOf("B")), false)
        list.currentIndex = rows.rowOfSection("BasicObjects")
    }

    function test_arrowsWalkAndSelect() {
        prepare()
        keyClick(Qt.Key_Down)
        compare(selectedNames(), "A")
        keyClick(Qt.Key_Down, Qt.ShiftModifier)
        compare(selectedNames(), "A,B")
        keyClick(Qt.Key_Down, Qt.ControlModifier)
        compare(selectedNames(), "A,B", "only the current row moves")
        keyClick(Qt.Key_Space, Qt.ControlModifier)
        compare(selectedNames(), "A,B,C")
        keyClick(Qt.Key_Escape)
        compare(selectedNames(), "")
        keyClick(Qt.Key_Up)
        compare(selectedNames(), "B")
        const unfolded = list.count
        keyClick(Qt.Key_Right)
        tryCompare(list, "count", unfolded + 2)
        keyClick(Qt.Key_Right)
        compare(list.currentIndex, rows.rowOfSubject(idOf("B")) + 1)
        keyClick(Qt.Key_Left)
        compare(list.currentIndex, rows.rowOfSubject(idOf("B")))
        keyClick(Qt.Key_Left)
        tryCompare(list, "count", unfolded)
        keyClick(Qt.Key_Left)
        compare(list.currentIndex, rows.rowOfSection("BasicObjects"))
        keyClick(Qt.Key_Home)
        compare(list.currentIndex, 0)
        keyClick(Qt.Key_End)
        compare(list.currentIndex, list.count - 1)
    }

    function test_commandsAreGivenByKeys() {
        prepare()
        keyClick(Qt.Key_Down)
        keyClick(Qt.Key_Space)
        tryVerify(() => !stage.entry("A", "Parameters/Enabled"))
        for (const open of [() => keyClick(Qt.Key_Menu), () => keyClick(Qt.Key_F10, Qt.ShiftModifier)]) {
            const before = stage.entry("A", "Parameters/Enabled")
            open()
            tryVerify(() => lineOf("Rename") !== null)
            settle(lineOf("Rename"))
            keyClick(Qt.Key_Down)
            keyClick(Qt.Key_Return)
            tryVerify(() => lineOf("Rename") === null && stage.entry("A", "Parameters/Enabled") === !before)
            tryVerify(() => list.activeFocus, 3000, "the focus is back in the list")
        }
        keyClick(Qt.Key_Menu)
        tryVerify(() => lineOf("Rename") !== null)
        keyClick(Qt.Key_Escape)
        tryVerify(() => lineOf("Rename") === null && list.activeFocus)
        keyClick(Qt.Key_F2)
        type("Zebra")
        keyClick(Qt.Key_Return)
        tryVerify(() => stage.has("Zebra"))
        tryVerify(() => list.activeFocus)
        keyClick(Qt.Key_Delete)
        byText("Remove subject?")
        keyClick(Qt.Key_Escape)
        tryVerify(() => gone("Remove subject?") && list.activeFocus)
        keyClick(Qt.Key_Delete)
        byText("Remove subject?")
        keyClick(Qt.Key_Return)
        tryVerify(() => !stage.has("Zebra"))
        tryVerify(() => list.activeFocus && panel.selectedSubjects.length === 0, 3000, "what has gone is not selected")
        keyClick(Qt.Key_Space)
        verify(stage.entry("B", "Parameters/Enabled") && stage.entry("C", "Parameters/Enabled"))
    }

    function test_tabLeadsToTheInspectorAndThroughIt() {
        prepare()
        keyClick(Qt.Key_Down)
        const inspector = find(item => item.pages !== undefined && item.show !== undefined)
        inspector.show("Selected")
        for (let i = 0; i < 10 && !within(inspector); ++i)
            keyClick(Qt.Key_Tab)
        verify(within(inspector))
        const seen = new Set()
        for (let i = 0; i < 40 && within(inspector); ++i) {
            seen.add(focused.Accessible.name || focused.text)
            verify(focused.visible && focused.width > 0)
            keyClick(Qt.Key_Tab)
        }
        verify(!within(inspector), "Tab leads out again")
        for (const name of ["Name", "Enabled", "Colour", "Proximity group"])
            verify(seen.has(name), name + " of " + Array.from(seen))
        keyClick(Qt.Key_Tab, Qt.ShiftModifier)
        verify(within(inspector))
        for (let i = 0; i < 60 && !list.activeFocus; ++i)
            keyClick(Qt.Key_Tab)
        verify(list.activeFocus)
        keyClick(Qt.Key_Tab)
        keyClick(Qt.Key_Right)
        byText("Not running")
        keyClick(Qt.Key_End)
        byText("New object")
        keyClick(Qt.Key_Home)
        byText("General")
    }

    function test_aSubjectIsBroughtIntoView() {
        for (let i = 0; i < 60; ++i)
            stage.add("BasicObjects", "Box " + i)
        stage.add("SmartObjects", "Glove")
        rowOf("Box 59")
        rows.collapseAll()
        list.positionViewAtBeginning()
        SubjectStore.backEnd.focusSubject(idOf("Box 40"))
        tryCompare(panel, "selectedSubjects", [idOf("Box 40")])
        tryVerify(() => list.currentItem?.subjectName === "Box 40")
        const y = list.currentItem.mapToItem(list, 0, 0).y
        verify(y >= 0 && y + list.currentItem.height <= list.height)
        rows.search = "Glove"
        tryCompare(rows, "shownCount", 1)
        SubjectStore.backEnd.focusSubject(idOf("Box 7"))
        tryVerify(() => rows.search === "" && list.currentItem?.subjectName === "Box 7", 3000, "a search is not in the way")
    }
}
