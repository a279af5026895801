import QtQuick
import QtTest
import Tavix.SubjectStore

PanelCase {
    id: test

    name: "Slots"

    /// A character with two slots, and two objects; nothing is assigned by itself.
    function prepare() {
        stage.add("CFCs", "Ada")
        stage.setSlots("Ada", ["Hips", "Chest"])
        stage.add("SmartObjects", "Glove")
        stage.add("BasicObjects", "Crate")
        for (const name of ["Glove", "Crate"])
            stage.set(name, "Parameters/AutoAssignEnabled", false)
        tryVerify(() => rows.totalCount === 3)
        rowBeneath("Ada", "Chest")
    }

    /// A row that is in view already: nothing scrolls beneath a button that is held.
    function shownRow(accept: var): Item {
        for (let row = 0; row < list.count; ++row) {
            const item = list.itemAtIndex(row)
            if (item && accept(item))
                return item
        }
        return null
    }

    function slotRow(name: string): Item {
        return shownRow(row => row.isSlot && row.slotName === name)
    }

    function subjectRow(name: string): Item {
        return shownRow(row => row.isSubject && row.subjectName === name)
    }

    function take(name: string) {
        const row = subjectRow(name)
        mousePress(row, row.width / 2, row.height / 2)
        for (let step = 1; step < 5; ++step)
            mouseMove(row, row.width / 2 + 4 * step, row.height / 2 + step)
    }

    function moveOver(item: Item) {
        mouseMove(item, item.width / 2 + 3, item.height / 2)
        mouseMove(item, item.width / 2, item.height / 2)
    }

    function dropOn(item: Item) {
        moveOver(item)
        mouseRelease(item, item.width / 2, item.height / 2)
    }

    function test_anObjectIsDraggedIntoAnEmptySlot() {
        prepare()
        for (const [object, slot] of [["Crate", "Chest"], ["Glove", "Hips"]]) {
            take(object)
            moveOver(slotRow(slot))
            tryCompare(slotRow(slot), "target", true)
            compare(shownRow(row => row.target && row.slotName !== slot), null)
            dropOn(slotRow(slot))
            tryVerify(() => stage.entry(object, "ParentSubjectId") === "Ada")
            compare(stage.slotOf(object), slot)
            tryVerify(() => slotRow(slot).subjectName === object, 3000, "the slot shows what is in it")
        }
    }

    function test_whatIsNoEmptySlotTakesNothing() {
        prepare()
        take("Crate")
        dropOn(slotRow("Chest"))
        tryVerify(() => slotRow("Chest").occupied)
        for (const wrong of [slotRow("Chest"), subjectRow("Ada"), subjectRow("Crate"), shownRow(row => row.isSection), null]) {
            take("Glove")
            moveOver(wrong ?? view)
            verify(shownRow(row => row.target) === null)
            verify(slotRow("Hips").droppable, "what takes it is marked")
            dropOn(wrong ?? view)
            verify(slotRow("Hips").droppable === false, "the drag is over")
            compare(stage.entry("Glove", "ParentSubjectId"), "")
        }
        compare(stage.slotOf("Crate"), "Chest")
    }

    function test_itIsSaidWhenNoSlotTakesAnObject() {
        prepare()
        stage.setSlots("Ada", [])
        tryVerify(() => slotRow("Chest") === null)
        take("Crate")
        byText("Crate: no slot takes it")
        dropOn(view)
        tryVerify(() => gone("Crate: no slot takes it"))
    }

    function test_escapeEndsADragWithoutEffect() {
        prepare()
        take("Crate")
        moveOver(slotRow("Hips"))
        tryCompare(slotRow("Hips"), "target", true)
        keyClick(Qt.Key_Escape)
        verify(!slotRow("Hips").droppable)
        moveOver(slotRow("Chest"))
        verify(!slotRow("Chest").droppable, "the same drag does not begin again")
        dropOn(slotRow("Chest"))
        compare(stage.entry("Crate", "ParentSubjectId"), "")
        take("Crate")
        dropOn(slotRow("Hips"))
        tryVerify(() => stage.slotOf("Crate") === "Hips", 3000, "the next one works")
    }

    function test_aDragLivesThroughWhatClientsDo() {
        prepare()
        take("Crate")
        moveOver(slotRow("Hips"))
        stage.setSlots("Ada", [])
        tryVerify(() => slotRow("Hips") === null)
        mouseRelease(view, 300, 500)
        byText("There is no such place.")
        compare(stage.entry("Crate", "ParentSubjectId"), "")
        stage.setSlots("Ada", ["Neck"])
        tryVerify(() => slotRow("Neck") !== null)
        take("Crate")
        moveOver(slotRow("Neck"))
        stage.remove("Crate")
        tryVerify(() => subjectRow("Crate") === null)
        dropOn(slotRow("Neck"))
        verify(!slotRow("Neck").droppable, "the drag is over")
        take("Glove")
        dropOn(slotRow("Neck"))
        tryVerify(() => stage.slotOf("Glove") === "Neck", 3000, "the next one works")
        tryVerify(() => gone("There is no such place."))
    }

    function test_aFoldedCharacterOpensUnderADrag() {
        prepare()
        rows.setExpanded(rows.rowOfSubject(idOf("Ada")), false)
        tryVerify(() => slotRow("Hips") === null)
        take("Crate")
        moveOver(subjectRow("Ada"))
        tryVerify(() => slotRow("Hips") !== null)
        moveOver(slotRow("Hips"))
        dropOn(slotRow("Hips"))
        tryVerify(() => stage.slotOf("Crate") === "Hips")
    }

    function test_menusPutObjectsIntoSlotsAndTakeThemOut() {
        prepare()
        choose(slotRow("Chest"), "Assign Crate")
        tryVerify(() => stage.slotOf("Crate") === "Chest")
        choose(rowOf("Glove"), "Assign to slot", "Ada / Hips")
        tryVerify(() => stage.slotOf("Glove") === "Hips")
        tryVerify(() => slotRow("Hips").subjectName === "Glove")
        choose(slotRow("Hips"), "Take out of slot")
        tryVerify(() => stage.slotOf("Glove") === "")
        compare(stage.entry("Glove", "ParentSubjectId"), "")
        tryVerify(() => !slotRow("Hips").occupied, 3000, "the slot is shown as empty")
        compare(stage.slotOf("Crate"), "Chest")
    }

    function test_aDetachedObjectIsNotAssignedByItselfAgain() {
        prepare()
        choose(slotRow("Chest"), "Assign Crate")
        tryVerify(() => slotRow("Chest").occupied)
        stage.set("Crate", "Parameters/AutoAssignEnabled", true)
        choose(slotRow("Chest"), "Detach")
        tryVerify(() => stage.slotOf("Crate") === "")
        compare(stage.entry("Crate", "Parameters/AutoAssignEnabled"), false)
        tryVerify(() => !slotRow("Chest").occupied)
    }

    function test_commandsOfAMenuAreOnlyThereWhenTheyCanWork() {
        prepare()
        const offered = text => lineOf(text)?.enabled === true
        press(rowOf("Crate"), Qt.RightButton)
        tryVerify(() => lineOf("Take out of slot") !== null)
        verify(!offered("Take out of slot") && !offered("Detach") && offered("Assign to slot"))
        keyClick(Qt.Key_Escape)
        tryVerify(() => lineOf("Detach") === null)
        // Filled by a client while the menu is open.
        press(slotRow("Chest"), Qt.RightButton)
        tryVerify(() => lineOf("Assign Crate") !== null)
        settle(lineOf("Assign Crate"))
        stage.remove("Crate")
        press(lineOf("Assign Crate"))
        byText("It is no longer there.")
        press(slotRow("Hips"), Qt.RightButton)
        tryVerify(() => lineOf("Assign Glove") !== null)
        keyClick(Qt.Key_Escape)
        tryVerify(() => lineOf("Assign Glove") === null)
        stage.remove("Glove")
        tryVerify(() => rows.totalCount === 1)
        press(slotRow("Hips"), Qt.RightButton)
        tryVerify(() => lineOf("No object can be assigned")?.enabled === false)
        keyClick(Qt.Key_Escape)
    }
}
