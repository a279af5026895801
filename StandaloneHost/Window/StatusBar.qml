import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore.Panel

/// What the server does, that edits cannot be kept, what went wrong since the program started, and what has just been
/// done.
Rectangle {
    id: bar

    required property var host

    readonly property var server: host.server
    readonly property var log: host.log

    signal copied(text: string)

    /// Shows a text for some seconds.
    function say(text: string) {
        message.text = text
        fade.restart()
    }

    function grouped(count: real): string {
        return Math.round(count).toLocaleString(Qt.locale(), "f", 0)
    }

    function counted(count: int, one: string, many: string): string {
        return count === 0 ? "no " + many : count === 1 ? "1 " + one : grouped(count) + " " + many
    }

    function rate(calls: real): string {
        return calls === 0 ? "no calls" : (calls < 10 ? calls.toFixed(1) : grouped(calls)) + " calls/s"
    }

    implicitHeight: Theme.rowHeight + 2 * Theme.spacing
    color: Theme.header

    Rectangle {
        width: parent.width
        height: 1
        color: Theme.line
    }

    RowLayout {
        anchors.fill: parent
        anchors.leftMargin: Theme.margin
        anchors.rightMargin: Theme.margin
        spacing: Theme.margin

        StatusButton {
            text: "http://" + bar.server.address
            dot: Theme.good
            explanation: "Where clients find this host. Click to copy it."
            onClicked: {
                bar.host.copy(text)
                bar.copied(text)
            }
        }

        Label {
            text: bar.counted(bar.server.clients, "connection", "connections")
            color: Theme.secondaryText
        }

        Label {
            text: bar.rate(bar.server.callsPerSecond)
            color: Theme.secondaryText
        }

        StatusButton {
            objectName: "storeFault"
            visible: bar.server.storeFault !== ""
            text: "Edits cannot be kept"
            dot: Theme.critical
            explanation: "Every edit is refused: " + bar.server.storeFault + ". Click to show or hide the log (Ctrl+L)."
            onClicked: bar.host.settings.logVisible = !bar.host.settings.logVisible
        }

        Label {
            id: message
            horizontalAlignment: Text.AlignRight
            elide: Text.ElideMiddle
            Layout.fillWidth: true

            Timer {
                id: fade
                interval: 6000
                onTriggered: message.text = ""
            }
        }

        StatusButton {
            readonly property bool quiet: bar.log.errors === 0 && bar.log.warnings === 0

            text: quiet ? "No warnings" : [bar.log.errors > 0 ? bar.counted(bar.log.errors, "error", "errors") : "",
                           bar.log.warnings > 0 ? bar.counted(bar.log.warnings, "warning", "warnings") : ""]
                          .filter(part => part !== "").join(", ")
            dot: bar.log.errors > 0 ? Theme.critical : quiet ? "transparent" : Theme.warning
            explanation: "Since the program started. Click to show or hide the log (Ctrl+L)."
            onClicked: bar.host.settings.logVisible = !bar.host.settings.logVisible
        }
    }

    component StatusButton: AbstractButton {
        id: button

        property color dot: "transparent"
        property string explanation

        padding: 0
        leftPadding: Theme.spacing
        rightPadding: Theme.spacing
        Layout.fillHeight: true
        Layout.topMargin: 1
        focusPolicy: Qt.TabFocus
        Accessible.name: text
        Accessible.description: explanation
        Keys.onReturnPressed: clicked()
        Keys.onEnterPressed: clicked()

        ToolTip.text: explanation
        ToolTip.visible: hovered
        ToolTip.delay: 600

        contentItem: Row {
            spacing: Theme.spacing

            Rectangle {
                visible: button.dot.a > 0
                anchors.verticalCenter: parent.verticalCenter
                width: 2 * Theme.unit
                height: width
                radius: width / 2
                color: button.dot
            }

            Label {
                text: button.text
                anchors.verticalCenter: parent.verticalCenter
            }
        }

        background: Rectangle {
            color: button.down ? Theme.line : button.hovered ? Theme.hovered : "transparent"
            border.width: button.visualFocus ? 1 : 0
            border.color: Theme.highlight
        }
    }
}
