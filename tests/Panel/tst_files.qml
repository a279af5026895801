import QtQuick
import QtTest
import Tavix.SubjectStore

/// Import and export. The file dialog is the platform's: what is tested begins with the file that was chosen in it.
PanelCase {
    id: test

    name: "Files"

    /// Answers the file dialog, which has that title.
    function chooseFile(title: string, file: string) {
        let loader = null
        tryVerify(() => (loader = find(item => item.then !== undefined && item.active === true)) !== null && loader.item.visible)
        compare(loader.item.title, title)
        loader.item.close()
        const url = "file://" + stage.folder() + "/" + file
        if (file.includes("/")) // other platforms' dialogs let somebody type that
            return loader.then(url)
        loader.item.selectedFile = url
        loader.item.accepted()
    }

    function importFile(kind: string, file: string) {
        press(byName("Add or import"))
        follow(kind + "…")
        chooseFile(kind, file)
    }

    function exportFile(name: string, kind: string, file: string) {
        choose(rowOf(name), kind + "…")
        chooseFile(kind, file)
    }

    /// Waits for a sentence, and for what it is about.
    function verifyTold(...parts) {
        tryVerify(() => find(item => parts.every(part => (item.text ?? "").includes(part)) && item.width > 0) !== null, 3000, parts.join())
    }

    function test_aSubjectIsExportedAndImported() {
        stage.add("BasicObjects", "Crate")
        stage.set("Crate", "Parameters/ProximityGroupName", "Hands")
        exportFile("Crate", "Export subject", "Crate one.xml")
        tryVerify(() => stage.fileExists("Crate one.xml"))
        stage.remove("Crate")
        importFile("Import subject", "Crate one.xml")
        tryVerify(() => stage.entry("Crate", "Parameters/ProximityGroupName") === "Hands")
        rowOf("Crate")
    }

    function test_aSubjectIsOnlyReplacedWhenThatIsWanted() {
        stage.add("BasicObjects", "Crate")
        stage.set("Crate", "Parameters/ProximityGroupName", "Hands")
        exportFile("Crate", "Export subject", "crate.xml")
        stage.set("Crate", "Parameters/ProximityGroupName", "Feet")
        importFile("Import subject", "crate.xml")
        byText("Replace subject?")
        verifyTold("there is a subject \"Crate\" already")
        press(byText("Cancel"))
        tryVerify(() => gone("Replace subject?"))
        compare(stage.entry("Crate", "Parameters/ProximityGroupName"), "Feet")
        importFile("Import subject", "crate.xml")
        press(byText("Replace"))
        tryVerify(() => stage.entry("Crate", "Parameters/ProximityGroupName") === "Hands")
        tryVerify(() => gone("Replace subject?"))
        compare(stage.names("BasicObjects"), ["Crate"])

        importFile("Import subject", "crate.xml")
        byText("Replace subject?")
        stage.writeFile("crate.xml", "<broken")
        press(byText("Replace"))
        verifyTold("crate.xml", ": ")
        verify(!gone("Replace subject?"), "the question is still there")
        compare(stage.entry("Crate", "Parameters/ProximityGroupName"), "Hands")
        press(byText("Cancel"))
        tryVerify(() => gone("Replace subject?"))
    }

    function test_aTemplateIsExportedAndUsed() {
        stage.add("SmartObjects", "Glove")
        stage.setClusters("Glove", [{ label: "Palm", device: "", pattern: 1 }])
        exportFile("Glove", "Export template", "Hand.sot")
        tryVerify(() => stage.fileExists("Hand.sot"))
        const made = panel.addSmartObject("Copy", "file://" + stage.folder() + "/Hand.sot")
        verify(!made.failed, made.reason)
        compare(stage.clusters("Copy")[0].split(" ")[0], "Palm")
    }

    function test_aMeshIsImported() {
        stage.writeFile("Rock.obj", "v 0 0 0")
        importFile("Import mesh", "Rock.obj")
        tryVerify(() => stage.names("SceneMeshes").length === 1)
        compare(stage.names("SceneMeshes"), ["Rock"])
        rowOf("Rock")
        importFile("Import mesh", "Rock.obj")
        verifyTold("Rock.obj", "there is a subject \"Rock\" already")
        stage.writeFile("Rock.txt", "v 0 0 0")
        importFile("Import mesh", "Rock.txt")
        verifyTold("Rock.txt", "this is no mesh by its name")
        compare(stage.names("SceneMeshes").length, 1)
    }

    function test_whatFailsSaysWhy() {
        stage.add("BasicObjects", "Crate")
        stage.add("SceneMeshes", "Rock")
        stage.writeFile("broken.xml", "<nonsense")
        importFile("Import subject", "broken.xml")
        verifyTold("broken.xml")
        importFile("Import subject", "no such folder/crate.xml")
        verifyTold("no such folder")
        importFile("Import subject", "broken.xml")
        verifyTold("broken.xml")
        exportFile("Crate", "Export subject", "broken.xml/crate.xml")
        verifyTold("broken.xml/crate.xml")
        exportFile("Rock", "Export template", "rock.sot")
        verifyTold("template")
        verify(!stage.fileExists("rock.sot"))
        choose(rowOf("Crate"), "Export subject…")
        stage.remove("Crate")
        chooseFile("Export subject", "crate.xml")
        verifyTold("there is no such subject")
        press(byName("Dismiss"))
        tryVerify(() => find(item => (item.text ?? "").includes("there is no such subject") && item.width > 0) === null)
        compare(stage.names("BasicObjects"), [])
    }
}
