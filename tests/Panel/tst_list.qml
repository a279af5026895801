import QtQuick
import QtTest
import Tavix.SubjectStore

PanelCase {
    id: test

    name: "List"

    function test_sectionsCountSubjectsAndWarnings() {
        stage.add("BasicObjects", "Crate")
        stage.add("BasicObjects", "Box")
        stage.set("Crate", "Warnings/WarningObjectConfusion", true)
        tryVerify(() => rows.totalCount === 2)
        const section = list.itemAtIndex(rows.rowOfSection("BasicObjects"))
        tryCompare(section, "count", 2)
        tryCompare(section, "warningCount", 1)
        press(section)
        keyClick(Qt.Key_Left)
        compare(rows.rowOfSection("LabellingClusters"), rows.rowOfSection("BasicObjects") + 1)
        keyClick(Qt.Key_Right)
        compare(rows.rowOfSection("LabellingClusters"), rows.rowOfSection("BasicObjects") + 3)
    }

    function test_whatAClientChangesShowsWithinATenthOfASecondOrSo() {
        stage.add("BasicObjects", "Crate")
        rowOf("Crate")
        stage.rename("Crate", "Zebra")
        const begun = Date.now()
        tryVerify(() => SubjectStore.subjectName(idOf("Zebra")) === "Zebra" && rowOf("Zebra") !== null)
        verify(Date.now() - begun < 1000)
    }

    function test_aSubjectIsRenamedInPlace() {
        stage.add("BasicObjects", "Crate")
        stage.add("BasicObjects", "Box")
        select("Crate")
        keyClick(Qt.Key_F2)
        type("Box")
        byText("A subject of that name exists already.")
        keyClick(Qt.Key_Return)
        verify(stage.has("Crate"), "a refused name is not taken")
        keyClick(Qt.Key_Escape)
        keyClick(Qt.Key_F2)
        type("Barrel")
        keyClick(Qt.Key_Return)
        tryVerify(() => stage.has("Barrel"))
        rowOf("Barrel")
        verify(list.activeFocus, "the focus is back in the list")
    }

    function test_subjectsAreEnabledAndDisabled() {
        for (const name of ["A", "B", "C"])
            stage.add("BasicObjects", name)
        select("A", "C")
        keyClick(Qt.Key_Space)
        tryCompare(rowOf("A"), "subjectEnabled", false)
        verify(!stage.entry("C", "Parameters/Enabled"))
        verify(stage.entry("B", "Parameters/Enabled"))
        choose(list.itemAtIndex(rows.rowOfSection("BasicObjects")), "Disable all subjects")
        tryVerify(() => !stage.entry("B", "Parameters/Enabled"))
        list.forceActiveFocus()
        keyClick(Qt.Key_A, Qt.ControlModifier)
        compare(panel.selectedSubjects.length, 3)
        choose(rowOf("B"), "Enable")
        tryVerify(() => ["A", "B", "C"].every(name => stage.entry(name, "Parameters/Enabled")))
    }

    function test_searchShowsWhatHoldsEveryWord() {
        stage.add("SmartObjects", "Glove left")
        stage.add("BasicObjects", "Crate")
        stage.setClusters("Glove left", [{ label: "Palm", device: "", pattern: 1 }])
        tryVerify(() => rows.totalCount === 2)
        keyClick(Qt.Key_F, Qt.ControlModifier)
        type("glove LEFT")
        tryCompare(rows, "shownCount", 1)
        rows.search = "palm"
        tryCompare(rows, "shownCount", 1)
        rows.search = "nothing of that"
        tryCompare(rows, "shownCount", 0)
    }

    function test_subjectsAreRemovedOnceConfirmed() {
        for (const name of ["A", "B"])
            stage.add("BasicObjects", name)
        select("A")
        keyClick(Qt.Key_Delete)
        press(byText("Cancel"))
        tryVerify(() => gone("Cancel"))
        verify(list.activeFocus, "the focus is back in the list")
        verify(stage.has("A"))
        keyClick(Qt.Key_Delete)
        press(byText("Remove"))
        tryVerify(() => !stage.has("A"))
        verify(stage.has("B"))
    }
}
