import QtQuick
import QtQuick.Controls
import QtQuick.Dialogs

/// The commands on files, which the plugin carries out.
Item {
    id: commands

    required property var host

    /// Has loadSubjectConfiguration, saveSubjectConfiguration, importSubject and importMesh, which answer a result; null
    /// when no plugin offers them.
    readonly property var store: host.store

    /// A command could not be done.
    signal failed(title: string, reason: string)
    /// `action` is to be called if somebody agrees to it.
    signal asked(title: string, text: string, answer: string, action: var)
    signal done(text: string)

    readonly property Action load: Action {
        text: "Load configuration…"
        shortcut: "Ctrl+O"
        enabled: commands.store !== null
        onTriggered: loadDialog.open()
    }
    readonly property Action save: Action {
        text: "Save configuration…"
        shortcut: "Ctrl+S"
        enabled: commands.store !== null
        onTriggered: saveDialog.open()
    }
    readonly property Action importSubject: Action {
        text: "Import subject…"
        shortcut: "Ctrl+I"
        enabled: commands.store !== null
        onTriggered: subjectDialog.open()
    }
    readonly property Action importMesh: Action {
        text: "Import mesh…"
        enabled: commands.store !== null
        onTriggered: meshDialog.open()
    }

    function nameOf(file: url): string {
        return decodeURIComponent(String(file).replace(/^.*\//, ""))
    }

    function conclude(result: var, title: string, success: string) {
        if (result.failed)
            commands.failed(title, result.reason !== "" ? result.reason : result.name)
        else
            commands.done(success)
    }

    function loadFrom(file: url) {
        const name = nameOf(file)
        const load = () => conclude(store.loadSubjectConfiguration(file), "“" + name + "” was not loaded", "Loaded " + name)
        const count = store.subjects().length
        if (count === 0)
            load()
        else
            commands.asked("Replace the stage?", "“" + name + "” takes the place of " +
                           (count === 1 ? "the subject that is" : "all " + count + " subjects that are") +
                           " on the stage. This cannot be undone.", "Replace", load)
    }

    function saveTo(file: url) {
        const name = nameOf(file)
        const save = () => conclude(store.saveSubjectConfiguration(file), "“" + name + "” was not saved", "Saved " + name)
        if (host.fileExists(file))
            commands.asked("Overwrite the file?", "There is a file “" + name + "” already.", "Overwrite", save)
        else
            save()
    }

    function importSubjectFrom(file: url, overwrite: bool) {
        const name = nameOf(file)
        const result = store.importSubject(file, overwrite)
        if (result.name !== "AlreadyPresent" || overwrite)
            return conclude(result, "“" + name + "” was not imported", "Imported " + name)
        commands.asked("Overwrite what is there?", result.reason + "\n\nThe subject on the stage that has that name is " +
                       "removed first.", "Overwrite", () => commands.importSubjectFrom(file, true))
    }

    function importMeshFrom(file: url) {
        const name = nameOf(file)
        conclude(store.importMesh(file), "“" + name + "” was not imported", "Imported " + name)
    }

    FileDialog {
        id: loadDialog
        title: "Load configuration"
        nameFilters: ["Subject configurations (*.xml)", "All files (*)"]
        onAccepted: commands.loadFrom(selectedFile)
    }

    FileDialog {
        id: saveDialog
        title: "Save configuration"
        fileMode: FileDialog.SaveFile
        acceptLabel: "Save"
        // Not every kind of dialog would ask.
        options: FileDialog.DontConfirmOverwrite // qmllint disable type property
        defaultSuffix: "xml"
        nameFilters: ["Subject configurations (*.xml)", "All files (*)"]
        onAccepted: commands.saveTo(selectedFile)
    }

    FileDialog {
        id: subjectDialog
        title: "Import subject"
        nameFilters: ["Subjects (*.xml)", "All files (*)"]
        onAccepted: commands.importSubjectFrom(selectedFile, false)
    }

    FileDialog {
        id: meshDialog
        title: "Import mesh"
        nameFilters: ["Meshes (*.obj *.ply *.stl)", "All files (*)"]
        onAccepted: commands.importMeshFrom(selectedFile)
    }
}
