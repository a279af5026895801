import QtQuick
import QtQuick.Controls

/// The heading of a part of a pane, set off from what is above it.
Item {
    id: heading

    property string text
    property string detail

    implicitHeight: title.implicitHeight + Theme.margin
    implicitWidth: title.implicitWidth + note.implicitWidth + Theme.margin
    Accessible.role: Accessible.Heading
    Accessible.name: text

    Label {
        id: title

        anchors.bottom: parent.bottom
        width: Math.min(implicitWidth, parent.width)
        text: heading.text
        color: Theme.text
        font.bold: true
        elide: Text.ElideRight
        Accessible.ignored: true
    }
    Label {
        id: note

        anchors.left: title.right
        anchors.leftMargin: Theme.margin
        anchors.right: parent.right
        anchors.baseline: title.baseline
        text: heading.detail
        color: Theme.secondaryText
        elide: Text.ElideRight
        horizontalAlignment: Text.AlignRight
    }
}
