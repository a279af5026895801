import QtQuick
import QtQuick.Controls

/// Stands where there is nothing to show, and says why.
Column {
    id: empty

    property string title
    property string text

    x: 2 * Theme.margin
    y: 12 * Theme.unit
    width: parent ? parent.width - 2 * x : 0
    spacing: Theme.spacing

    Label {
        width: parent.width
        text: empty.title
        color: Theme.text
        font.bold: true
        horizontalAlignment: Text.AlignHCenter
        wrapMode: Text.Wrap
    }
    Label {
        width: parent.width
        text: empty.text
        color: Theme.secondaryText
        horizontalAlignment: Text.AlignHCenter
        wrapMode: Text.Wrap
    }
}
