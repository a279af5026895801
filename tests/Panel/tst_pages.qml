import QtQuick
import QtTest
import Tavix.SubjectStore

/// The inspector's pages that are not about the selected subjects: calibration, evaluation, devices.
PanelCase {
    id: test

    name: "Pages"

    readonly property string settings: "Application/Settings/SubjectStore/"

    function cleanup() {
        if (panel.calibration.running)
            panel.calibration.cancel()
        panel.evaluation.setEnabled(false)
        stage.setApplicationEntry(settings + "CreateSubjectName", "")
    }

    function test_aSubjectIsCalibrated() {
        showPage("Calibration")
        byText("Not running")
        verifyRefused(button("Start"), "No name is given.")
        for (const [text, reason] of [["Accept T-pose", "No subject calibration is running."], ["Stop", "No subject calibration is running."], ["Cancel", "No subject calibration is running."]])
            verifyRefused(button(text), reason)
        tryCompare(byName("Name"), "text", "")
        fill(byName("Name"), "Eve")
        keyClick(Qt.Key_Return)
        pick(byName("Skin"), "Child")
        tryVerify(() => stage.setting("CreateSubjectSkin").endsWith("/Child.skin"))
        pick(byName("Labelling template"), "Performer with staff")
        tryCompare(button("Start"), "enabled", true)
        press(button("Start"))
        byText("Looking for the T-pose")
        compare(stage.entry("Eve", "Parameters/Calibration"), 1)
        compare(stage.names("GeneralSubjects"), ["Eve"])
        compare(stage.names("Props").length, 1, "what the template has beneath the subject is there too")
        tryCompare(byName("Name"), "enabled", false)
        verifyRefused(button("Start"), "A subject calibration is running.")
        verifyRefused(button("Stop"), "The T-pose has not been accepted yet.")
        press(button("Accept T-pose"))
        byText("Calibrating, first pass")
        verifyRefused(button("Accept T-pose"), "The T-pose has been accepted already.")
        press(button("Stop"))
        byText("Not running")
        byText("Last run: The last calibration was completed.")
        compare(stage.entry("Eve", "Parameters/Calibration"), 2)
    }

    function test_aCalibrationIsRepeatedAndCancelled() {
        stage.add("GeneralSubjects", "Eve")
        stage.set("Eve", "Parameters/Calibration", 2)
        showPage("Calibration")
        tryCompare(byName("Name"), "text", "")
        fill(byName("Name"), "Eve")
        keyClick(Qt.Key_Return)
        verifyRefused(button("Start"), "There is a subject named \"Eve\" already.")
        tryCompare(button("Recalibrate"), "enabled", true)
        press(button("Recalibrate"))
        byText("Looking for the T-pose")
        tryVerify(() => stage.entry("Eve", "Parameters/Calibration") === 1)
        press(button("Cancel"))
        byText("Last run: The last calibration was cancelled.")
        compare(stage.entry("Eve", "Parameters/Calibration"), 2)
        press(button("Recalibrate"))
        byText("Looking for the T-pose")
        stage.remove("Eve")
        press(button("Accept T-pose"))
        byText("Calibrating, first pass")
        press(button("Stop"))
        tryVerify(() => find(item => /^Last run: The last calibration failed: /.test(item.text ?? "")) !== null)
        verifyRefused(button("Recalibrate"), "The subject to calibrate does not exist any more.")
    }

    function test_objectsThatAreAlikeAreFound() {
        showPage("Evaluation")
        const places = [[0, 0, 0], [100, 0, 0], [0, 200, 0], [0, 0, 300]]
        for (const name of ["Crate", "Box"]) {
            stage.add("BasicObjects", name)
            stage.setMarkers(name, places)
        }
        stage.add("BasicObjects", "Stool")
        stage.setMarkers("Stool", [[0, 0, 0], [400, 0, 0], [0, 90, 0], [0, 30, 170]])
        const toggle = find(item => item.checkable === true && item.text === "Compare objects")
        enter(toggle)
        tryVerify(() => panel.evaluation.enabled)
        tryCompare(toggle, "checked", true)
        byText("9 of 9 comparisons")
        const pair = byName("Crate with Box, 0.0 mm apart")
        compare(stage.entry("Crate", "Warnings/WarningObjectConfusion") || stage.entry("Crate", "Warnings/WarningObjectConfusionCritical"), true)
        verify(!stage.entry("Stool", "Warnings/WarningObjectConfusion"))
        press(pair)
        tryVerify(() => panel.selectedSubjects.length === 1)
        verify(["Crate", "Box"].includes(SubjectStore.subjectName(panel.selectedSubjects[0])))
        verify(rowOf(SubjectStore.subjectName(panel.selectedSubjects[0])).selected)
        showPage("Selected")
        tryVerify(() => find(item => /^(Crate|Box), 0.0 mm apart$/.test(item.Accessible.name)) !== null, 3000, "the object's own page tells it too")
        showPage("Evaluation")
        stage.setMarkers("Box", [[0, 0, 0], [10, 500, 0], [0, 20, 0], [100, 0, 35]])
        byText("None: all objects can be told apart.")
        tryVerify(() => !stage.entry("Crate", "Warnings/WarningObjectConfusion"))
        enter(toggle)
        tryVerify(() => !panel.evaluation.enabled && !toggle.checked)
        tryVerify(() => gone("Objects that are alike"))
    }

    function test_howObjectsAreComparedIsSet() {
        showPage("Evaluation")
        const threshold = byName("Warn below this distance, in mm")
        const before = panel.evaluation.warningThreshold
        for (const [text, shown] of [["2.5", "2.5"], [String(before), String(before)]]) {
            fill(threshold, text)
            keyClick(Qt.Key_Return)
            tryCompare(threshold, "displayText", shown)
            tryCompare(panel.evaluation, "warningThreshold", Number(shown))
        }
        const steps = byName("Steps for a comparison, at most")
        const most = panel.evaluation.maximumStepCount
        fill(steps, "12345")
        keyClick(Qt.Key_Return)
        tryCompare(panel.evaluation, "maximumStepCount", 12345)
        panel.evaluation.setMaximumStepCount(most)
        tryVerify(() => Number.fromLocaleString(Qt.locale(), steps.displayText) === most)
    }

    function deviceRow(urn: string): Item {
        let found = null
        tryVerify(() => (found = find(item => item.urn === urn && item.linkedTo !== undefined)) !== null, 3000, urn)
        return found
    }

    function test_devicesAreSelectedAndBecomeSmartObjects() {
        showPage("Devices")
        byText("No devices")
        for (const urn of ["urn-1", "urn-2", "urn-3", "urn-4"])
            stage.addDevice(urn)
        const selected = () => panel.selection.map(item => item.device).join()
        press(deviceRow("urn-2"))
        compare(selected(), "urn-2")
        press(deviceRow("urn-4"), Qt.LeftButton, Qt.ControlModifier)
        compare(selected(), "urn-2,urn-4")
        press(deviceRow("urn-2"), Qt.LeftButton, Qt.ControlModifier)
        compare(selected(), "urn-4")
        press(deviceRow("urn-1"))
        press(deviceRow("urn-3"), Qt.LeftButton, Qt.ShiftModifier)
        compare(selected(), "urn-1,urn-2,urn-3")
        keyClick(Qt.Key_Home)
        keyClick(Qt.Key_Down, Qt.ShiftModifier)
        compare(selected(), "urn-1,urn-2")
        verifyRefused(button("Reboot linked objects"), "Select devices that are linked to smart objects.")
        press(button("Create smart objects"))
        tryVerify(() => stage.names("SmartObjects").length === 2)
        const made = stage.names("SmartObjects")[0]
        tryCompare(deviceRow("urn-1"), "linkedTo", made)
        tryVerify(() => rowOf(made).selected, 3000, "what was made is in view")

        press(deviceRow("urn-1"))
        verifyRefused(button("Create smart objects"), "Not possible with these devices.")
        press(button("Reboot linked objects"))
        tryCompare(deviceRow("urn-1"), "connected", false)
        compare(deviceRow("urn-2").connected, true)
        press(button("Reboot linked objects"))
        byText("\"urn-1\" cannot be restarted: The device is not connected.")
        tryCompare(deviceRow("urn-1"), "connected", true)
        press(button("Reboot linked objects"))
        tryVerify(() => gone("\"urn-1\" cannot be restarted: The device is not connected."))
        tryCompare(deviceRow("urn-1"), "connected", true)
    }
}
