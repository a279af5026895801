import QtQuick
import QtTest
import Tavix.SubjectStore

/// The inspector's pages about the selected subjects: parameters, scaling, presets; and the settings.
PanelCase {
    id: test

    name: "Inspector"

    function selectFirst(...names) {
        tryVerify(() => names.every(name => idOf(name)))
        select(...names)
        showPage("Selected")
    }

    function test_aNameIsOnlyTakenWhenItIsGood() {
        stage.add("BasicObjects", "Crate")
        stage.add("BasicObjects", "Box")
        selectFirst("Crate")
        const field = byName("Name")
        for (const [typed, problem] of [["Box", "A subject of that name exists already."], ["a/b", "A name cannot contain \"/\"."], [" ", "A name cannot begin or end with a space."]]) {
            fill(field, typed)
            byText(problem)
            keyClick(Qt.Key_Return)
            verify(stage.has("Crate"), problem)
            keyClick(Qt.Key_Escape)
            tryCompare(field, "text", "Crate")
            verify(gone(problem), problem)
        }
        fill(field, "Barrel")
        keyClick(Qt.Key_Return)
        tryVerify(() => stage.has("Barrel") && rowOf("Barrel"))
        stage.rename("Barrel", "Zebra")
        tryCompare(field, "text", "Zebra")
    }

    function test_parametersAreChangedAndFollowTheStore() {
        stage.add("BasicObjects", "Crate")
        selectFirst("Crate")
        const enabled = checkBox("Enabled")
        enter(enabled)
        tryVerify(() => stage.entry("Crate", "Parameters/Enabled") === false)
        stage.set("Crate", "Parameters/Enabled", true)
        tryCompare(enabled, "checked", true)

        const group = byName("Proximity group")
        fill(group, "Hands")
        keyClick(Qt.Key_Return)
        compare(stage.entry("Crate", "Parameters/ProximityGroupName"), "Hands")
        fill(group, "Feet")
        keyClick(Qt.Key_Tab)
        compare(stage.entry("Crate", "Parameters/ProximityGroupName"), "Feet", "leaving takes it too")
        stage.set("Crate", "Parameters/ProximityGroupName", "Heads")
        tryCompare(group, "text", "Heads")

        const number = byName("Markers to recognise it by")
        for (const [typed, problem] of [["3", ""], ["2.5", "The value is not one that \"Markers to recognise it by\" can have."], ["-1", "The value is not one that \"Markers to recognise it by\" can have."]]) {
            fill(number, typed)
            keyClick(Qt.Key_Return)
            compare(stage.entry("Crate", "Parameters/EntranceThreshold"), 3)
            if (problem)
                byText(problem)
            tryCompare(number, "displayText", "3")
        }
        keyClick(Qt.Key_Up)
        tryVerify(() => stage.entry("Crate", "Parameters/EntranceThreshold") === 4)
        verify(gone("The value is not one that \"Markers to recognise it by\" can have."))
    }

    function test_aColourIsTypedOrPicked() {
        stage.add("BasicObjects", "Crate")
        selectFirst("Crate")
        const field = byName("Colour")
        fill(field, "#1234")
        byText("A colour is written #rrggbb.")
        keyClick(Qt.Key_Return)
        keyClick(Qt.Key_Escape)
        fill(field, "#12ABef")
        keyClick(Qt.Key_Return)
        compare(stage.entry("Crate", "Parameters/ColourRGBA"), "#ff12abef")
        tryCompare(rowOf("Crate"), "colour", "#ff12abef")
        press(byText("Colour: choose from a palette"))
        settle(byText("Colour")) // the palette's heading
        keyClick(Qt.Key_Home)
        keyClick(Qt.Key_Right)
        keyClick(Qt.Key_Down)
        keyClick(Qt.Key_Return)
        tryVerify(() => stage.entry("Crate", "Parameters/ColourRGBA") !== "#ff12abef")
        tryCompare(field, "text", "#" + stage.entry("Crate", "Parameters/ColourRGBA").slice(3))
    }

    function test_itIsClearWhichSubjectIsChanged() {
        for (const name of ["Crate", "Box"])
            stage.add("BasicObjects", name)
        showPage("Selected")
        byText("Nothing is selected")
        selectFirst("Box", "Crate")
        byText("The first of 2 that are selected. A preset is applied to all of them; everything else is changed for this one only.")
        compare(byName("Name").text, "Box")
        enter(checkBox("Enabled"))
        tryVerify(() => !stage.entry("Box", "Parameters/Enabled"))
        verify(stage.entry("Crate", "Parameters/Enabled"))
        stage.remove("Box")
        tryVerify(() => byName("Name").text === "Crate", 3000, "the next one is shown")
        stage.set("Crate", "Warnings/WarningObjectConfusion", true)
        tryVerify(() => find(item => item.colour !== undefined && /confus|alike|taken for/i.test(item.text ?? "")) !== null)
    }

    function test_aPresetIsChosenForAllSelectedObjects() {
        for (const name of ["Crate", "Box"])
            stage.add("BasicObjects", name)
        stage.addPreset(1, "Hand prop", "#ff102030")
        selectFirst("Crate", "Box")
        const box = byName("Preset")
        tryCompare(box, "count", 1)
        pick(box, "Hand prop")
        for (const name of ["Crate", "Box"]) {
            tryVerify(() => stage.entry(name, "Parameters/PresetName") === "Hand prop")
            compare(stage.entry(name, "Parameters/ColourRGBA"), "#ff102030")
        }
        tryCompare(box, "displayText", "Hand prop")
    }

    function test_aPageIsLaidOutAtAnySize() {
        stage.add("BasicObjects", "Crate")
        stage.setMarkers("Crate", [[0, 0, 0], [100, 0, 0], [0, 200, 0]])
        selectFirst("Crate")
        const page = find(item => item.emptyTitle !== undefined && item.contentHeight > 0)
        const last = button("Scale to measured distances…")
        const height = test.height
        // Where the content is about as tall as the page: the picture of the markers is lower on a narrower one.
        for (let room = -12; room <= 12; room += 2) {
            settle(last)
            test.height += page.contentHeight - page.height + room
            wait(0)
        }
        settle(last)
        verify(Math.abs(page.height - page.contentHeight) < 20, "the sizes in question were there")
        test.height = height
    }

    function test_anObjectIsScaledToMeasuredDistances() {
        stage.add("BasicObjects", "Crate")
        stage.setMarkers("Crate", [[0, 0, 0], [100, 0, 0], [0, 200, 0]])
        selectFirst("Crate")
        enter(button("Scale to measured distances…"))
        byText("No measurements yet")
        verifyRefused(button("Scale"), "Add a measurement first.")
        press(button("Add measurement"))
        const near = byName("Measured distance between Marker 1 to marker 2, in mm")
        verifyRefused(button("Scale"), "Enter all the distances that you have measured.")
        fill(near, "110")
        keyClick(Qt.Key_Return)
        byName("Scale factor: 1.1000")
        pick(byName("Second marker"), "Marker 1")
        verifyRefused(button("Add measurement"), "Choose two different markers.")
        pick(byName("Second marker"), "Marker 3")
        press(button("Add measurement"))
        fill(byName("Measured distance between Marker 1 to marker 3, in mm"), "260")
        keyClick(Qt.Key_Tab)
        byName("Scale factor: 1.2000")
        press(byName("Remove the measurement between Marker 1 to marker 2"))
        byName("Scale factor: 1.3000")
        press(button("Scale"))
        tryVerify(() => stage.markers("Crate")[1][0] !== 100)
        fuzzyCompare(stage.markers("Crate")[1][0], 130, 0.001)
        fuzzyCompare(stage.markers("Crate")[2][1], 260, 0.001)
        tryVerify(() => gone("Add measurement"))
    }

    function test_scalingIsLeftWithoutEffectOrRefused() {
        stage.add("BasicObjects", "Crate")
        stage.setMarkers("Crate", [[0, 0, 0], [100, 0, 0]])
        selectFirst("Crate")
        for (const leave of [() => press(button("Cancel")), () => keyClick(Qt.Key_Escape)]) {
            enter(button("Scale to measured distances…"))
            press(button("Add measurement"))
            fill(byName("Measured distance between Marker 1 to marker 2, in mm"), "110")
            keyClick(Qt.Key_Return)
            leave()
            tryVerify(() => gone("Add measurement"))
            compare(stage.markers("Crate")[1][0], 100)
        }
        enter(button("Scale to measured distances…"))
        press(button("Add measurement"))
        fill(byName("Measured distance between Marker 1 to marker 2, in mm"), "110")
        keyClick(Qt.Key_Return)
        stage.setMarkers("Crate", [[0, 0, 0], [150, 0, 0]])
        press(button("Scale"))
        byText("The object's markers have changed meanwhile.")
        compare(stage.markers("Crate")[1][0], 150)
        press(button("Cancel"))
        tryVerify(() => gone("Add measurement"))
    }

    function test_presetsAreMadeAppliedAndRemoved() {
        for (const name of ["Crate", "Box"])
            stage.add("BasicObjects", name)
        stage.set("Crate", "Parameters/ProximityGroupName", "Hands")
        selectFirst("Crate")
        showPage("Presets")
        byText("No presets yet")
        verifyRefused(button("Add"), "Enter a name first.")
        const field = byName("Name of a new preset")
        fill(field, "Hand prop")
        keyClick(Qt.Key_Return)
        tryVerify(() => stage.applicationEntry("Application/ObjectPresets/1/Name") === "Hand prop")
        compare(stage.applicationEntry("Application/ObjectPresets/1/Parameters/ProximityGroupName"), "Hands")
        tryCompare(field, "text", "")
        fill(field, "Hand prop")
        byText("There is a preset with this name.")
        verify(!button("Add").enabled)
        keyClick(Qt.Key_Escape)

        press(byText("Hand prop"))
        select("Box")
        press(button("Apply"))
        tryVerify(() => stage.entry("Box", "Parameters/ProximityGroupName") === "Hands")
        compare(stage.entry("Box", "Parameters/PresetName"), "Hand prop")
        stage.setApplicationEntry("Application/ObjectPresets/1/ReadOnly", true)
        byText("Read-only")
        press(byText("Hand prop"))
        verifyRefused(button("Remove"), "This preset is read-only.")
        keyClick(Qt.Key_Delete)
        compare(stage.applicationEntry("Application/ObjectPresets/1/Name"), "Hand prop")
        stage.setApplicationEntry("Application/ObjectPresets/1/ReadOnly", false)
        tryVerify(() => gone("Read-only"))
        press(byText("Hand prop"))
        keyClick(Qt.Key_Delete)
        tryVerify(() => stage.applicationEntry("Application/ObjectPresets/1/Name") === "")
        byText("No presets yet")
    }

    function test_aPresetThatSuitsNotAllIsToldAndAppliedToNone() {
        stage.add("BasicObjects", "Crate")
        stage.add("LabellingClusters", "Cluster")
        stage.addPreset(1, "Hand prop", "#ff102030")
        selectFirst("Crate", "Cluster")
        const before = stage.entry("Crate", "Parameters/ColourRGBA")
        showPage("Presets")
        press(byText("Hand prop"))
        press(button("Apply to 2 objects"))
        byText("That is not of the right type.")
        compare(stage.entry("Crate", "Parameters/ColourRGBA"), before)
        press(byName("Close the message"))
        tryVerify(() => gone("That is not of the right type."))
    }

    function test_settingsAreKept() {
        showPage("Settings")
        enter(checkBox("Capture video"))
        tryVerify(() => stage.setting("CaptureVideo") === true)
        enter(checkBox("Capture video"))
        tryVerify(() => stage.setting("CaptureVideo") === false)
        const period = byName("Keep cancelled calibrations (s), in seconds")
        fill(period, "7.5")
        keyClick(Qt.Key_Return)
        compare(stage.setting("CancelledCalibrationGracePeriod"), 7.5)
        const template = byName("Labelling template")
        for (const choice of ["Performer with staff", "Performer"]) {
            pick(template, choice)
            tryVerify(() => stage.setting("CreateSubjectTemplate").endsWith("/" + choice + ".lbt"))
            tryCompare(template, "displayText", choice)
        }
    }

    function test_whatCannotBeMadeSaysWhy() {
        stage.add("BasicObjects", "Crate")
        showPage("Settings")
        byName("Create object: No name is given.")
        let group = byText("New object")
        const isName = item => item.Accessible.name === "Name"
        while (!find(isName, group))
            group = group.parent
        const field = find(isName, group)
        fill(field, "Crate")
        byText("A subject of that name exists already.")
        keyClick(Qt.Key_Return)
        byName("Create object: There is a subject named \"Crate\" already.")
        fill(field, "Barrel")
        keyClick(Qt.Key_Return)
        byName("Create object: Possible")
        compare(stage.setting("CreateObjectName"), "Barrel")
        fill(field, "")
        keyClick(Qt.Key_Backspace)
        keyClick(Qt.Key_Return)
        byName("Create object: No name is given.")
    }
}
