import QtQuick
import QtQuick.Layouts

/// What went wrong last, until it is closed or something succeeds.
Rectangle {
    id: bar

    property string text

    function show(result: var) {
        bar.text = result && result.failed ? result.reason || result.name : ""
    }

    visible: text !== ""
    implicitHeight: content.implicitHeight + 2 * Theme.spacing
    color: Theme.raised
    border.color: Theme.critical

    RowLayout {
        id: content

        anchors.fill: parent
        anchors.leftMargin: Theme.margin
        anchors.rightMargin: Theme.spacing
        spacing: Theme.spacing

        FailureLabel {
            Layout.fillWidth: true
            text: bar.text
            Accessible.role: Accessible.AlertMessage
        }
        IconButton {
            Layout.alignment: Qt.AlignTop
            tip: qsTr("Close the message")
            symbol: "close"
            onClicked: bar.text = ""
        }
    }
}
