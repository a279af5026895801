import QtQuick
import QtQuick.Dialogs
import Tavix.SubjectStore

/// What commands ask before they can be carried out. What takes time to load is loaded when it is first asked for.
Item {
    id: dialogs

    required property var panel
    /// The item near which palettes open.
    property Item place
    property real placeX
    property real placeY

    readonly property alias confirm: confirm
    readonly property alias add: add
    readonly property alias swap: swap
    readonly property alias group: group

    /// How something ended that was asked for here.
    signal done(var result)
    signal added(string name)

    function near(item: Item, x: real, y: real) {
        place = item
        placeX = x
        placeY = y
    }

    function recolour(subjects: var) {
        colours.subjects = subjects
        colours.openAt(place ? place : dialogs, placeX, placeY)
    }

    function repattern(subject: var, cluster: int, pattern: int) {
        patterns.subject = subject
        patterns.cluster = cluster
        patterns.current = patterns.choices.indexOf(pattern)
        patterns.openAt(place ? place : dialogs, placeX, placeY)
    }

    function exportTo(subject: var, asTemplate: bool) {
        chooseFile(asTemplate ? qsTr("Export template") : qsTr("Export subject"), true, file => done(asTemplate ? SubjectStore.exportTemplate(subject, file) : SubjectStore.exportSubject(subject, file)))
    }

    function importFrom(mesh: bool) {
        chooseFile(mesh ? qsTr("Import mesh") : qsTr("Import subject"), false, file => mesh ? done(SubjectStore.importMesh(file)) : importSubject(file))
    }

    /// A subject of the same name is only replaced by who says so.
    function importSubject(file: url) {
        askToReplace(file, SubjectStore.importSubject(file, false))
    }

    function askToReplace(file: url, result: var) {
        if (result.name !== "AlreadyPresent")
            return done(result)
        confirm.ask(qsTr("Replace subject?"), result.reason, qsTr("Replace"), "", () => SubjectStore.importSubject(file, true))
    }

    function chooseFile(title: string, save: bool, then: var) {
        files.active = true
        files.item.title = title
        files.item.fileMode = save ? FileDialog.SaveFile : FileDialog.OpenFile
        files.then = then
        files.item.open()
    }

    ConfirmDialog {
        id: confirm
    }

    GroupDialog {
        id: group
    }

    AddSubjectDialog {
        id: add

        panel: dialogs.panel
        onAdded: name => dialogs.added(name)
        onFileWanted: dialogs.chooseFile(qsTr("Add template"), false, file => add.addTemplate(file))
    }

    SwapClustersDialog {
        id: swap
    }

    ColourPalette {
        id: colours

        property var subjects: []

        onPicked: colour => dialogs.done(dialogs.panel.setColour(subjects, colour))
    }

    PatternPalette {
        id: patterns

        property var subject
        property int cluster

        onPicked: pattern => dialogs.done(dialogs.panel.setClusterPattern(subject, cluster, pattern))
    }

    Loader {
        id: files

        property var then: () => {}

        active: false
        // qmllint disable unqualified
        sourceComponent: FileDialog {
            parentWindow: dialogs.Window.window
            onAccepted: files.then(selectedFile)
        }
        // qmllint enable unqualified
    }
}
