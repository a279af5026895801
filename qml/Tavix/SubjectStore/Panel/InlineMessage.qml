import QtQuick
import QtQuick.Layouts

/// Tells of a failure until somebody has seen it. It takes no room while there is none.
Rectangle {
    id: message

    property string text

    function show(sentence: string) {
        text = sentence
    }

    function clear() {
        text = ""
    }

    visible: text !== ""
    implicitHeight: visible ? content.implicitHeight + 2 * Theme.unit : 0
    color: Qt.alpha(Theme.critical, 0.16)
    Accessible.role: Accessible.AlertMessage
    Accessible.name: text

    Rectangle {
        width: Theme.unit / 2
        height: parent.height
        color: Theme.critical
    }

    RowLayout {
        id: content

        anchors.left: parent.left
        anchors.right: parent.right
        anchors.verticalCenter: parent.verticalCenter
        anchors.leftMargin: Theme.margin
        anchors.rightMargin: Theme.unit
        spacing: Theme.margin

        Icon {
            Layout.alignment: Qt.AlignVCenter
            name: "failure"
            colour: Theme.critical
        }

        Text {
            Layout.fillWidth: true
            text: message.text
            wrapMode: Text.Wrap
            maximumLineCount: 4
            elide: Text.ElideRight
            color: Theme.text
            textFormat: Text.PlainText
        }

        IconButton {
            symbol: "close"
            tip: qsTr("Dismiss")
            onClicked: message.clear()
        }
    }
}
