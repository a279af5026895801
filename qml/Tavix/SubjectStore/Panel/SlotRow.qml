import QtQuick
import QtQuick.Layouts

/// A slot of a character, and the object in it.
RowLayout {
    id: line

    required property var row

    spacing: Theme.spacing
    anchors.leftMargin: Theme.nameMargin
    anchors.rightMargin: Theme.unit

    Text {
        Layout.preferredWidth: Math.max(Theme.rowHeight * 3, line.width * 0.3)
        text: line.row.slotName
        elide: Text.ElideRight
        color: Theme.secondaryText
        textFormat: Text.PlainText
    }

    ColourSwatch {
        visible: line.row.occupied
        colour: line.row.colour
    }

    Text {
        id: label

        Layout.fillWidth: true
        text: line.row.occupied ? line.row.subjectName : qsTr("empty")
        elide: Text.ElideRight
        color: line.row.occupied ? Theme.text : Theme.disabledText
        font.italic: !line.row.occupied
        textFormat: Text.PlainText

        HoverTip {
            text: label.text
            offered: label.truncated
        }
    }

    PatternChips {
        visible: line.row.occupied && patterns.length > 0
        patterns: line.row.patterns
        most: 2
    }

    SubjectWarnings {
        row: line.row
    }
}
