import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore.Panel

/// A menu of the host, with the commands that plugins add to it after its own. Whether those can be done is asked when
/// the menu opens.
Menu {
    id: hostMenu

    /// VCommand, each.
    property var commands: []

    /// A command could not be done.
    signal failed(title: string, reason: string)

    function perform(command: var) {
        const reason = command.trigger()
        if (reason !== "")
            hostMenu.failed(command.text, reason)
    }

    background: Rectangle {
        color: Theme.surface
        border.color: Theme.line
    }

    // As wide as the widest of what stands in it, which the style leaves to the hostMenu.
    function fit() {
        let widest = 50 * Theme.unit
        for (let i = 0; i < hostMenu.count; ++i)
            widest = Math.max(widest, hostMenu.itemAt(i).implicitWidth)
        hostMenu.width = Math.ceil(widest) + hostMenu.leftPadding + hostMenu.rightPadding
    }

    onAboutToShow: {
        for (const command of commands)
            command.ask()
        fit()
    }

    Instantiator {
        model: hostMenu.commands
        delegate: CommandItem {
            required property var modelData

            text: modelData.text
            keys: modelData.shortcut
            description: modelData.toolTip
            colour: modelData.colour
            enabled: modelData.possible
            reason: modelData.reason
            // qmllint disable unqualified
            onTriggered: hostMenu.perform(modelData)
            onImplicitWidthChanged: Qt.callLater(hostMenu.fit) // a reason is laid out after it was given
            // qmllint enable unqualified
        }
        onObjectAdded: (index, object) => hostMenu.addItem(object)
        onObjectRemoved: (index, object) => hostMenu.removeItem(object)
    }

    // The keys work while the menu is closed, when nobody has asked yet; a command that cannot be done says why.
    Instantiator {
        model: hostMenu.commands
        delegate: Shortcut {
            required property var modelData

            sequence: modelData.shortcut
            enabled: modelData.shortcut !== ""
            onActivated: hostMenu.perform(modelData) // qmllint disable unqualified
        }
    }
}
