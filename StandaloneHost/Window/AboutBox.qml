import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore.Panel

/// Which program this is, and where clients find it.
HostDialog {
    id: box

    required property var host

    readonly property string address: host.server.address

    title: "About the subject store"
    widest: 120 * Theme.unit

    contentItem: ColumnLayout {
        spacing: 2 * Theme.margin

        Label {
            text: "A stage of subjects for motion capture, and a remote-control API over it.\n" + box.host.version
            wrapMode: Text.Wrap
            Layout.fillWidth: true
        }

        GridLayout {
            columns: 2
            columnSpacing: 2 * Theme.margin
            rowSpacing: Theme.spacing

            Repeater {
                model: [
                    "WebSocket", "ws://" + box.address + "/rpc",
                    "HTTP", "http://" + box.address + "/rpc",
                    "Description", "http://" + box.address + "/openrpc.json",
                    "In a browser", "http://" + box.address + "/"
                ]

                TextEdit {
                    required property string modelData
                    required property int index

                    text: modelData
                    font: box.font // qmllint disable unqualified
                    color: index % 2 === 0 ? Theme.secondaryText : Theme.text
                    selectionColor: Theme.highlight
                    selectedTextColor: Theme.highlightedText
                    readOnly: true
                    selectByMouse: true
                }
            }
        }
    }

    footer: DialogButtonBox {
        background: null
        padding: Theme.margin

        Button {
            text: "Close"
            DialogButtonBox.buttonRole: DialogButtonBox.RejectRole // qmllint disable type
        }
    }
}
