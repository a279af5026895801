import QtQuick
import QtQuick.Layouts
import Tavix.SubjectStore

/// Makes a basic object, or a smart object or a character from a template.
PanelDialog {
    id: dialog

    required property var panel
    /// "basic", "smart" or "character".
    property string kind: "basic"
    /// The files of the templates.
    property var templates: []

    readonly property var kinds: ({
            "basic": qsTr("Add basic object"),
            "smart": qsTr("Add smart object"),
            "character": qsTr("Add character")
        })

    signal added(string name)
    signal fileWanted

    function ask(what: string) {
        kind = what
        readTemplates()
        name.text = ""
        show(name)
    }

    function readTemplates() {
        templates = kind === "basic" ? [] : SubjectStore.paths(templateType())
    }

    function templateType(): int {
        return kind === "smart" ? SubjectStoreQml.ESmartObjectTemplate : SubjectStoreQml.ECFCTemplate
    }

    function addTemplate(file: url) {
        tell(SubjectStore.copyFileToUserFolder(file, templateType()))
        readTemplates()
        choice.currentIndex = templates.length - 1
    }

    /// The file's name without folder and ending.
    function baseName(file: var): string {
        return decodeURIComponent(file.toString()).replace(/^.*\//, "").replace(/\.[^.]*$/, "")
    }

    title: kinds[kind]
    acceptText: qsTr("Add")
    acceptable: name.text !== "" && name.problem === "" && (kind === "basic" || choice.currentIndex >= 0)
    onCommitted: {
        const made = name.text
        const file = templates[choice.currentIndex]
        const result = kind === "basic" ? panel.addBasicObject(made) : kind === "smart" ? panel.addSmartObject(made, file) : panel.addCharacter(made, file)
        finish(result)
        if (!result.failed)
            added(made)
    }

    GridLayout {
        Layout.fillWidth: true
        columns: 2
        columnSpacing: Theme.margin
        rowSpacing: Theme.margin

        Text {
            text: qsTr("Name")
            color: Theme.secondaryText
        }

        NameField {
            id: name

            Layout.fillWidth: true
            focus: true
            problem: dialog.visible && dialog.panel && text !== "" ? dialog.panel.nameProblem(text, dialog.panel.noSubject) : ""
            Accessible.name: qsTr("Name")
        }

        Item {
            visible: name.problem !== ""
        }

        Text {
            Layout.fillWidth: true
            visible: name.problem !== ""
            text: name.problem
            wrapMode: Text.Wrap
            color: Theme.critical
        }

        Text {
            visible: dialog.kind !== "basic"
            text: qsTr("Template")
            color: Theme.secondaryText
        }

        RowLayout {
            Layout.fillWidth: true
            visible: dialog.kind !== "basic"
            spacing: Theme.spacing

            DialogComboBox {
                id: choice

                Layout.fillWidth: true
                enabled: dialog.templates.length > 0
                model: dialog.templates.map(file => dialog.baseName(file))
                displayText: enabled ? currentText : qsTr("There are no templates yet")
                onEntered: dialog.commit()
                Accessible.name: qsTr("Template")
            }

            PanelButton {
                text: qsTr("Add file…")
                onClicked: dialog.fileWanted()
            }
        }
    }
}
