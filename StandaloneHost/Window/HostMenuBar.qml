import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore.Panel

/// The menus of the window. Those that only plugins know stand before the last one.
MenuBar {
    id: bar

    required property var host
    required property FileCommands files

    readonly property var ownTitles: ["File", "Edit", "View", "Help"]

    signal quit
    signal about
    signal failed(title: string, reason: string)

    HostMenu {
        title: "&File"
        commands: bar.host.commands.commandsOf("File")
        onFailed: (title, reason) => bar.failed(title, reason)

        CommandItem { action: bar.files.load }
        CommandItem { action: bar.files.save }
        MenuLine {}
        CommandItem { action: bar.files.importSubject }
        CommandItem { action: bar.files.importMesh }
        MenuLine {}
        CommandItem {
            action: Action {
                text: "Quit"
                shortcut: "Ctrl+Q"
                onTriggered: bar.quit()
            }
        }
    }

    HostMenu {
        id: edit
        title: "&Edit"
        commands: bar.host.commands.commandsOf("Edit")
        onFailed: (title, reason) => bar.failed(title, reason)

        CommandItem {
            text: "Nothing to edit"
            enabled: false
            visible: edit.commands.length === 0
            height: visible ? implicitHeight : 0
        }
    }

    HostMenu {
        title: "&View"
        commands: bar.host.commands.commandsOf("View")
        onFailed: (title, reason) => bar.failed(title, reason)

        CommandItem {
            action: Action {
                text: "Colours of the system"
                checkable: true
                checked: bar.host.settings.theme === Theme.System
                ActionGroup.group: schemes
                onTriggered: bar.host.settings.theme = Theme.System
            }
        }
        CommandItem {
            action: Action {
                text: "Light"
                checkable: true
                checked: bar.host.settings.theme === Theme.Light
                ActionGroup.group: schemes
                onTriggered: bar.host.settings.theme = Theme.Light
            }
        }
        CommandItem {
            action: Action {
                text: "Dark"
                checkable: true
                checked: bar.host.settings.theme === Theme.Dark
                ActionGroup.group: schemes
                onTriggered: bar.host.settings.theme = Theme.Dark
            }
        }
        MenuLine {}
        CommandItem {
            action: Action {
                text: "Log"
                shortcut: "Ctrl+L"
                checkable: true
                checked: bar.host.settings.logVisible
                onTriggered: bar.host.settings.logVisible = checked
            }
        }
    }

    HostMenu {
        id: help
        title: "&Help"
        commands: bar.host.commands.commandsOf("Help")
        onFailed: (title, reason) => bar.failed(title, reason)

        CommandItem {
            action: Action {
                text: "About"
                onTriggered: bar.about()
            }
        }
    }

    Instantiator {
        model: bar.host.commands.titlesBeside(bar.ownTitles)
        delegate: HostMenu {
            required property string modelData

            title: modelData
            // qmllint disable unqualified
            commands: bar.host.commands.commandsOf(modelData)
            onFailed: (title, reason) => bar.failed(title, reason)
            // qmllint enable unqualified
        }
        onObjectAdded: (index, object) => bar.insertMenu(bar.count - 1, object)
        onObjectRemoved: (index, object) => bar.removeMenu(object)
    }

    component MenuLine: MenuSeparator {
        contentItem: Rectangle {
            implicitHeight: 1
            color: Theme.line
        }
    }

    ActionGroup {
        id: schemes
    }
}
