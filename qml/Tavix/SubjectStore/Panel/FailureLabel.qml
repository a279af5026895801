import QtQuick
import QtQuick.Controls
import QtQuick.Layouts

/// A sentence that says what is wrong; takes no room while there is none.
RowLayout {
    id: failure

    property string text
    property color colour: Theme.critical

    visible: text !== ""
    spacing: Theme.spacing
    Accessible.role: Accessible.StaticText
    Accessible.name: text

    Icon {
        Layout.alignment: Qt.AlignTop
        name: "failure"
        colour: failure.colour
    }
    Label {
        id: sentence

        Layout.fillWidth: true
        text: failure.text
        textFormat: Text.PlainText
        color: failure.colour
        wrapMode: Text.Wrap
        Accessible.ignored: true
    }
}
