import QtQuick
import QtTest
import Tavix.SubjectStore

PanelCase {
    id: test

    name: "SmartObjects"

    /// A smart object of clusters "label device pattern"; "-" stands for no device.
    function addSmart(name: string, ...clusters) {
        add("SmartObjects", name)
        verify(stage.setClusters(name, clusters.map(text => {
            const [label, device, pattern, type] = text.split(" ")
            return { label: label, device: device === "-" ? "" : device, pattern: Number(pattern), type: type ?? "Corvex1" }
        })))
    }

    /// Turns a combo box to a text by keys.
    function turn(box: Item, text: string) {
        box.forceActiveFocus()
        for (let i = 0; i < box.count && box.currentText !== text; ++i)
            keyClick(Qt.Key_Down)
        compare(box.currentText, text)
    }

    function test_smartObjectsAreMergedAndSplit() {
        addSmart("Head", "Front - 1")
        addSmart("Hand", "Front - 2", "Back - 3")
        add("BasicObjects", "Crate")
        select("Hand")
        const line = openMenu(rowOf("Hand"), "Merge")
        verify(!line.enabled)
        mouseMove(line, line.width / 2, line.height / 2)
        byText("Select two or more smart objects.")
        leaveMenu()
        select("Hand", "Crate")
        verify(!openMenu(rowOf("Hand"), "Merge").enabled)
        leaveMenu()
        select("Hand", "Head")
        choose(rowOf("Head"), "Merge")
        tryVerify(() => !stage.has("Head"))
        compare(stage.clusters("Hand"), ["Front  2", "Back  3", "Front 2  1"])
        tryVerify(() => idOf("Head") === undefined)

        select("Hand")
        choose(rowOf("Hand"), "Split")
        tryVerify(() => stage.names("SmartObjects").length === 3)
        compare(stage.clusters("Hand"), ["Front  2"])
        compare(stage.clusters("Hand Back"), ["Back  3"])
        rowOf("Hand Front 2")
        verify(!openMenu(rowOf("Hand"), "Split").enabled)
        leaveMenu()
    }

    function test_clustersAreSwapped() {
        addSmart("Hand", "Front - 1", "Back - 2")
        addSmart("Head", "Brow - 3")
        select("Hand", "Head")
        choose(rowOf("Hand"), "Swap clusters…")
        turn(byName("Cluster of the first object"), "Back")
        press(byText("Swap"))
        tryVerify(() => gone("Swap clusters"))
        compare(stage.clusters("Hand"), ["Front  1", "Brow  3"])
        compare(stage.clusters("Head"), ["Back  2"])

        select("Hand")
        choose(rowOf("Hand"), "Swap clusters…")
        const second = byName("Cluster of the second object")
        compare(second.currentText, "Brow")
        turn(byName("Cluster of the first object"), "Brow")
        verify(!byText("Swap").enabled, "a cluster is not swapped with itself")
        keyClick(Qt.Key_Up)
        keyClick(Qt.Key_Return)
        tryVerify(() => gone("Swap clusters"))
        compare(stage.clusters("Hand"), ["Brow  3", "Front  1"])

        select("Head", "Hand")
        choose(rowOf("Hand"), "Swap clusters…")
        byText("Swap clusters")
        stage.remove("Head")
        press(byText("Swap"))
        byText("This does not fit what is selected.")
        compare(stage.clusters("Hand"), ["Brow  3", "Front  1"])
        keyClick(Qt.Key_Escape)
        tryVerify(() => gone("Swap clusters"))
    }

    function test_patternsAreAssigned() {
        compare(stage.commandProblem(), "There are no smart objects.")
        addSmart("Hand", "Front - 1", "Back - 1")
        addSmart("Head", "Brow - 1")
        compare(stage.commandProblem(), "")
        choose(sectionOf("SmartObjects"), "Assign optimal patterns")
        tryCompare(rowBeneath("Hand", "Back"), "patterns", [2])
        compare(stage.clusters("Hand").concat(stage.clusters("Head")), ["Front  1", "Back  2", "Brow  3"])

        stage.setClusters("Head", [{ label: "Brow", pattern: 2 }])
        verify(stage.triggerCommand())
        compare(stage.clusters("Head"), ["Brow  3"])

        addSmart("Visor", "Rim - 1 Quarex10")
        choose(sectionOf("SmartObjects"), "Assign optimal patterns")
        byName("No set of patterns serves all these types of cluster together.")
        stage.remove("Visor")
        choose(sectionOf("SmartObjects"), "Assign optimal patterns")
        tryVerify(() => find(item => item.Accessible.role === Accessible.AlertMessage) === null, 3000, "success takes the message away")
    }

    function test_patternsAreAssignedAutomatically() {
        addSmart("Hand", "Front - 1", "Back - 1")
        choose(sectionOf("SmartObjects"), "Assign patterns automatically")
        tryVerify(() => panel.autoPatternManagement)
        verify(openMenu(sectionOf("SmartObjects"), "Assign patterns automatically").checked)
        leaveMenu()
        stage.setClusters("Hand", [{ label: "Front", pattern: 4 }, { label: "Back", pattern: 4 }])
        tryVerify(() => stage.clusters("Hand")[1] === "Back  1")
        choose(sectionOf("SmartObjects"), "Assign patterns automatically")
        tryVerify(() => !panel.autoPatternManagement)
        verify(!openMenu(sectionOf("SmartObjects"), "Assign patterns automatically").checked)
        leaveMenu()
        stage.setClusters("Hand", [{ label: "Front", pattern: 4 }, { label: "Back", pattern: 4 }])
        wait(100)
        compare(stage.clusters("Hand"), ["Front  4", "Back  4"])
    }

    function test_aClustersPatternIsChosen() {
        addSmart("Hand", "Front - 1", "Back - 2")
        choose(rowBeneath("Hand", "Back"), "Pattern…")
        press(byName("Pattern 5"))
        tryVerify(() => stage.clusters("Hand")[1] === "Back  5")
        compare(stage.clusters("Hand")[0], "Front  1")
        tryCompare(rowBeneath("Hand", "Back"), "patterns", [5])

        choose(rowBeneath("Hand", "Back"), "Pattern…")
        compare(openPalette().currentItem.modelData, 5)
        press(byName("Pattern 64"))
        byName("Pattern 64 is not in use at present.")
        compare(stage.clusters("Hand")[1], "Back  5")

        choose(rowBeneath("Hand", "Back"), "No pattern")
        tryVerify(() => stage.clusters("Hand")[1] === "Back  0")
        tryCompare(rowBeneath("Hand", "Back"), "patterns", [0])
        verify(!openMenu(rowBeneath("Hand", "Back"), "No pattern").enabled)
        leaveMenu()

        choose(rowBeneath("Hand", "Front"), "Pattern…")
        openPalette()
        stage.remove("Hand")
        press(byName("Pattern 3"))
        byName(notThere)
    }

    function test_aClusterIsLinkedToADevice() {
        stage.addDevice("urn:one")
        stage.addDevice("urn:two")
        addSmart("Hand", "Front - 1", "Back - 2")
        choose(rowBeneath("Hand", "Front"), "Device", "urn:one")
        tryVerify(() => stage.clusters("Hand")[0] === "Front urn:one 1")
        tryCompare(rowBeneath("Hand", "Front"), "devices", ["urn:one"])
        verify(!openMenu(rowBeneath("Hand", "Back"), "Device", "urn:one (Hand)").checked, "the other cluster has no device")
        verify(lineOf("None").checked)
        leaveMenu()
        verify(openMenu(rowBeneath("Hand", "Front"), "Device", "urn:one").checked)
        press(lineOf("urn:one"))
        tryVerify(() => lineOf("Device") === null)
        verify(list.activeFocus, "the focus is back in the list")
        verify(openMenu(rowBeneath("Hand", "Front"), "Device", "urn:one").checked, "choosing it again changes nothing")
        leaveMenu()
        choose(rowBeneath("Hand", "Front"), "Device", "None")
        tryVerify(() => stage.clusters("Hand")[0] === "Front  1")

        openMenu(rowBeneath("Hand", "Front"), "Device", "urn:two")
        stage.remove("Hand")
        tryVerify(() => rows.totalCount === 0)
        press(lineOf("urn:two"))
        byName(notThere)
    }

    function test_devicesAreRebooted() {
        const connected = "Application/Devices/urn:one/Connected"
        stage.addDevice("urn:one")
        addSmart("Hand", "Front urn:one 1")
        addSmart("Head", "Brow - 2")
        add("BasicObjects", "Crate")
        select("Hand", "Crate")
        choose(rowOf("Hand"), "Reboot devices")
        compare(stage.applicationEntry(connected), "false")
        choose(rowOf("Hand"), "Reboot devices")
        byName("\"urn:one\" cannot be restarted: The device is not connected.")
        tryVerify(() => stage.applicationEntry(connected) === "true")
        select("Head")
        choose(rowOf("Head"), "Reboot devices")
        byName("No device is linked to what is selected.")
    }

    function test_smartObjectsAreMadeOfSelectedDevices() {
        stage.addDevice("one")
        stage.addDevice("two")
        stage.addDevice("three")
        press(byName("Add or import"))
        tryVerify(() => lineOf("Smart objects from selected devices") !== null)
        verify(!lineOf("Smart objects from selected devices").enabled)
        leaveMenu()
        showPage("Devices")
        press(byName("one, Corvex1 · not linked, 100 %"))
        press(byName("two, Corvex1 · not linked, 100 %"), Qt.LeftButton, Qt.ControlModifier)
        press(byName("Add or import"))
        follow("Smart objects from selected devices")
        tryVerify(() => stage.has("one") && stage.has("two"))
        verify(!stage.has("three"))
        compare(stage.clusters("one"), ["Cluster one 1"])
        compare(stage.clusters("two"), ["Cluster two 2"])
        tryVerify(() => rowOf("one").selected)
        byName("one, Corvex1 · linked to one, 100 %")
        showPage("Selected")
    }
}
