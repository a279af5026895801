import QtQuick
import QtTest
import Tavix.SubjectStore
import Tavix.SubjectStore.Panel

PanelCase {
    id: test

    name: "Commands"

    function test_coloursAreTakenFromThePalette() {
        const path = "Parameters/ColourRGBA"
        add("BasicObjects", "A", "B", "C")
        const before = stage.entry("C", path)
        select("A", "B")
        choose(rowOf("B"), "Colour…")
        const cell = openPalette().itemAtIndex(9)
        const picked = cell.modelData
        press(cell)
        tryVerify(() => stage.entry("A", path) === picked && stage.entry("B", path) === picked)
        compare(stage.entry("C", path), before)
        tryCompare(rowOf("A"), "colour", picked)
        compare(panel.selectedSubjects.length, 2, "the row beneath the palette is not clicked")

        choose(rowOf("B"), "Colour…")
        const grid = openPalette()
        keyClick(Qt.Key_Down)
        keyClick(Qt.Key_Down)
        keyClick(Qt.Key_Right)
        const marked = grid.currentItem.modelData
        verify(marked !== picked)
        keyClick(Qt.Key_Return)
        tryVerify(() => stage.entry("A", path) === marked && stage.entry("B", path) === marked)
        tryVerify(() => list.activeFocus, 3000, "the focus is back in the list")

        choose(rowOf("B"), "Colour…")
        const third = openPalette().itemAtIndex(9)
        stage.remove("A")
        tryVerify(() => panel.selectedSubjects.length === 1)
        press(third)
        byName(notThere)
        compare(stage.entry("B", path), marked)
        press(byName("Dismiss"))
        tryVerify(() => gone(notThere))
    }

    function test_objectsArePutIntoGroups_data() {
        return [
            { tag: "proximity", menu: "Proximity group", head: "New proximity group", path: "Parameters/ProximityGroupName" },
            { tag: "template", menu: "Template group", head: "New template group", path: "Parameters/TemplateGroupName" }
        ]
    }

    function test_objectsArePutIntoGroups(data: var) {
        add("BasicObjects", "A", "B", "C")
        stage.set("C", data.path, "Team")
        select("A", "B")
        choose(rowOf("A"), data.menu, "Team")
        tryVerify(() => stage.entry("A", data.path) === "Team" && stage.entry("B", data.path) === "Team")
        verify(openMenu(rowOf("B"), data.menu, "Team").checked)
        verify(!lineOf("None").checked)
        leaveMenu()
        choose(rowOf("A"), data.menu, "None")
        tryVerify(() => stage.entry("A", data.path) === "" && stage.entry("B", data.path) === "")
        compare(stage.entry("C", data.path), "Team")

        choose(rowOf("A"), data.menu, "New…")
        byText(data.head)
        type("  ")
        verify(!byText("Create").enabled, "a name is needed")
        type("Crew")
        keyClick(Qt.Key_Return)
        tryVerify(() => stage.entry("A", data.path) === "Crew" && stage.entry("B", data.path) === "Crew")
        tryVerify(() => gone(data.head))
        tryVerify(() => list.activeFocus, 3000, "the focus is back in the list")

        choose(rowOf("A"), data.menu, "New…")
        byText(data.head)
        type("Late")
        stage.remove("B")
        tryVerify(() => panel.selectedSubjects.length === 1)
        press(byText("Create"))
        byText(notThere)
        compare(stage.entry("A", data.path), "Crew")
        keyClick(Qt.Key_Escape)
        tryVerify(() => gone(data.head))
    }

    /// What is not an object has no groups, presets or slots: a command passes it by.
    function test_commandsTakeWhatTheyAreForOfAMixedSelection() {
        add("CFCs", "Ada")
        add("BasicObjects", "A", "B")
        stage.set("B", "Parameters/ProximityGroupName", "Team")
        stage.addPreset(1, "Red", "#ffff0000")
        const before = stage.entry("Ada", "Parameters/AutoAssignEnabled")
        select("Ada", "A")
        choose(rowOf("A"), "Proximity group", "Team")
        tryVerify(() => stage.entry("A", "Parameters/ProximityGroupName") === "Team")
        choose(rowOf("A"), "Do not assign automatically")
        tryVerify(() => stage.entry("A", "Parameters/AutoAssignEnabled") === false)
        compare(stage.entry("Ada", "Parameters/AutoAssignEnabled"), before)
        choose(rowOf("A"), "Apply preset", "Red")
        tryVerify(() => stage.entry("A", "Parameters/ColourRGBA") === "#ffff0000")
        choose(rowOf("A"), "Calibrate")
        tryVerify(() => stage.entry("Ada", "Parameters/Calibration") > 0)
    }

    function test_presetsAreApplied() {
        add("BasicObjects", "A", "B")
        stage.addPreset(1, "Red", "#ffff0000")
        stage.addPreset(2, "Tom & Jerry", "#ff00ff00")
        select("A", "B")
        choose(rowOf("A"), "Apply preset", "Red")
        tryVerify(() => ["A", "B"].every(name => stage.entry(name, "Parameters/ColourRGBA") === "#ffff0000"))
        compare(stage.entry("B", "Parameters/PresetName"), "Red")
        openMenu(rowOf("A"), "Apply preset", "Tom & Jerry")
        verify(find(item => item.subMenu === undefined && item.text === "Tom & Jerry" && item.contentItem === undefined), "a name shows as it is")
        leaveMenu()
        select("B")
        for (const seen of [() => true, () => panel.selectedSubjects.length === 0]) {
            add("BasicObjects", "C")
            select("C")
            openMenu(rowOf("C"), "Apply preset", "Red")
            stage.remove("C")
            tryVerify(seen)
            press(lineOf("Red"))
            byName(notThere)
            press(byName("Dismiss"))
            tryVerify(() => gone(notThere))
        }
    }

    function test_aMenuIsForWhatItWasOpenedFor() {
        add("BasicObjects", "A", "B", "C")
        select("A", "B")
        openMenu(rowOf("A"), "Disable")
        stage.remove("B")
        tryVerify(() => panel.selectedSubjects.length === 1)
        press(lineOf("Disable"))
        byName(notThere)
        verify(stage.entry("A", "Parameters/Enabled"), "all of it or nothing")
        tryVerify(() => lineOf("Disable") === null)
        choose(rowOf("A"), "Enable or disable")
        tryVerify(() => !stage.entry("A", "Parameters/Enabled"))
        verify(stage.entry("C", "Parameters/Enabled"))
    }

    function test_charactersAreCalibrated() {
        const path = "Parameters/Calibration"
        add("CFCs", "Ada", "Ben")
        select("Ada", "Ben")
        choose(rowOf("Ada"), "Calibrate")
        compare(stage.entry("Ben", path), 1)
        tryVerify(() => find(item => item.text === "Calibrating…", rowOf("Ada")) !== null)
        tryVerify(() => stage.entry("Ada", path) === 2 && stage.entry("Ben", path) === 2)
        tryVerify(() => find(item => item.text === "Calibrated", rowOf("Ben")) !== null)
        select("Ben")
        choose(rowOf("Ben"), "Remove calibration")
        tryVerify(() => find(item => item.text === "Not calibrated", rowOf("Ben")) !== null)
        compare(stage.entry("Ben", path), 0)
        compare(stage.entry("Ada", path), 2)
    }

    function test_subjectsAreAdded_data() {
        return [
            { tag: "basic", line: "Basic object…", kind: "BasicObjects" },
            { tag: "smart", line: "Smart object from template…", kind: "SmartObjects" },
            { tag: "character", line: "Character from template…", kind: "CFCs" }
        ]
    }

    function test_subjectsAreAdded(data: var) {
        add("BasicObjects", "Old")
        tryVerify(() => rows.totalCount === 1)
        press(byName("Add or import"))
        follow(data.line)
        verify(!byText("Add").enabled, "a name is needed")
        const name = byName("Name")
        for (const [text, problem] of [["Old", "A subject of that name exists already."], ["a?", "A name cannot contain \"?\"."]]) {
            type(text)
            byText(problem)
            compare(name.problem, problem)
            verify(!byText("Add").enabled)
            keyClick(Qt.Key_Return)
            keyClick(Qt.Key_A, Qt.ControlModifier)
        }
        type("New")
        verify(gone("A subject of that name exists already."))
        verify(byText("Add").enabled)
        keyClick(Qt.Key_Return)
        tryVerify(() => stage.has("New"))
        compare(stage.names(data.kind).slice(-1), ["New"])
        tryVerify(() => gone("Add"))
        tryVerify(() => rowOf("New").selected, 3000, "what was added is selected")
        if (data.kind === "SmartObjects")
            compare(stage.clusters("New"), ["Cluster  1"])
        if (data.kind === "CFCs")
            rowBeneath("New", "Pelvis")

        press(byName("Add or import"))
        follow(data.line)
        verify(!byText("Add").enabled)
        type("Late")
        stage.add("BasicObjects", "Late")
        press(byText("Add"))
        byText("That name is in use already.")
        keyClick(Qt.Key_Escape)
        tryVerify(() => gone("Add"))
    }

    function test_whatIsAddedShowsInSpiteOfTheSearch() {
        rows.search = "zebra"
        choose(sectionOf("BasicObjects"), "Add basic object…")
        byText("Add")
        type("Crate")
        press(byText("Add"))
        tryVerify(() => rowOf("Crate").selected)
        compare(rows.search, "")
    }

    function test_objectsAreAssignedAutomatically() {
        const path = "Parameters/AutoAssignEnabled"
        add("BasicObjects", "A", "B", "C")
        const before = stage.entry("C", path)
        select("A", "B")
        choose(rowOf("A"), "Do not assign automatically")
        tryVerify(() => stage.entry("A", path) === false && stage.entry("B", path) === false)
        choose(rowOf("A"), "Assign automatically")
        tryVerify(() => stage.entry("A", path) === true && stage.entry("B", path) === true)
        compare(stage.entry("C", path), before)
    }

    function test_whatIsAssignedStaysUnlessItIsToGoAsWell() {
        const option = "Remove what is assigned to them as well"
        for (const name of ["Ada", "Ben"]) {
            add("CFCs", name)
            stage.setSlots(name, ["Hip"])
            add("SmartObjects", name + "Hip")
            stage.set(name + "Hip", "ParentSubjectId", name)
        }
        select("Ada")
        choose(rowOf("Ada"), "Remove…")
        byText(option)
        press(byText("Remove"))
        tryVerify(() => !stage.has("Ada"))
        compare(stage.entry("AdaHip", "ParentSubjectId"), "")
        tryVerify(() => gone("Remove"))

        select("Ben")
        keyClick(Qt.Key_Delete)
        const box = byText(option)
        verify(!box.checked, "it is asked anew")
        press(box)
        press(byText("Remove"))
        tryVerify(() => !stage.has("Ben") && !stage.has("BenHip"))
        verify(stage.has("AdaHip"))
        tryVerify(() => gone("Remove"))

        select("AdaHip")
        keyClick(Qt.Key_Delete)
        byText("Remove subject?")
        verify(gone(option), "an object has nothing that is assigned to it")
        stage.remove("AdaHip")
        tryVerify(() => panel.selectedSubjects.length === 0)
        press(byText("Remove"))
        byText(notThere)
        press(byText("Cancel"))
        tryVerify(() => gone("Cancel"))
    }

    function test_aSubjectIsRenamedByItsMenu() {
        add("BasicObjects", "Crate")
        choose(rowOf("Crate"), "Rename")
        type("Barrel")
        keyClick(Qt.Key_Return)
        tryVerify(() => stage.has("Barrel"))
        tryVerify(() => list.activeFocus, 3000, "the focus is back in the list")
    }

    function test_whatAClientRemovesIsNotSelectedAnyMore() {
        add("BasicObjects", "A", "B", "C")
        select("A", "B")
        stage.remove("A")
        tryVerify(() => panel.selectedSubjects.length === 1)
        keyClick(Qt.Key_Space)
        tryVerify(() => !stage.entry("B", "Parameters/Enabled"))
        stage.remove("B")
        tryVerify(() => panel.selectedSubjects.length === 0)
        keyClick(Qt.Key_Delete)
        verify(gone("Cancel"), "there is nothing to remove")
    }
}
