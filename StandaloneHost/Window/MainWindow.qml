import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore.Panel

/// The host's window: menus, the operator's panel, the log beneath it, and what the server does.
ApplicationWindow {
    id: window

    /// What the window knows of the program (VWindow, which also places and shows the window).
    required property var host

    title: host.server.address
    minimumWidth: 110 * Theme.unit
    minimumHeight: 75 * Theme.unit
    color: Theme.window

    palette.window: Theme.window
    palette.windowText: Theme.text
    palette.base: Theme.surface
    palette.alternateBase: Theme.raised
    palette.text: Theme.text
    palette.button: Theme.raised
    palette.buttonText: Theme.text
    palette.brightText: Theme.highlightedText
    palette.highlight: Theme.highlight
    palette.highlightedText: Theme.highlightedText
    palette.light: Theme.raised
    palette.midlight: Theme.header
    palette.mid: Theme.line
    palette.dark: Theme.secondaryText
    palette.shadow: Theme.line
    palette.link: Theme.highlight
    palette.placeholderText: Theme.disabledText
    palette.toolTipBase: Theme.raised
    palette.toolTipText: Theme.text
    palette.disabled.text: Theme.disabledText
    palette.disabled.windowText: Theme.disabledText
    palette.disabled.buttonText: Theme.disabledText
    palette.disabled.highlightedText: Theme.disabledText

    menuBar: HostMenuBar {
        host: window.host
        files: files
        onQuit: window.close()
        onAbout: about.open()
        onFailed: (title, reason) => messageBox.tell(title, reason)
    }

    footer: StatusBar {
        host: window.host
        onCopied: text => say("Copied " + text)
        id: statusBar
    }

    onClosing: close => {
        close.accepted = host.mayClose()
        if (!close.accepted)
            messageBox.tell("Not now", "Something is still going on that cannot be broken off.")
    }

    Binding {
        target: Theme
        property: "scheme"
        value: window.host.settings.theme
    }

    SplitView {
        anchors.fill: parent
        orientation: Qt.Vertical

        PanelFrame {
            host: window.host
            focus: true
            SplitView.fillHeight: true
            SplitView.minimumHeight: 25 * Theme.unit
        }

        LogView {
            host: window.host
            visible: window.host.settings.logVisible
            onCopied: count => statusBar.say(count === 1 ? "Copied one line of the log" : "Copied " + count + " lines of the log")
        }
    }

    FileCommands {
        id: files
        objectName: "files"
        host: window.host
        onFailed: (title, reason) => messageBox.tell(title, reason)
        onAsked: (title, text, answer, action) => messageBox.ask(title, text, answer, action)
        onDone: text => statusBar.say(text)
    }

    MessageBox {
        id: messageBox
        objectName: "messageBox"
    }

    AboutBox {
        id: about
        host: window.host
    }
}
