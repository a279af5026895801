import QtQuick
import QtQuick.Layouts

/// A subject, or a child of one.
RowLayout {
    id: line

    required property var row

    readonly property string name: row.subjectName

    signal toggleEnabled

    spacing: Theme.spacing
    anchors.leftMargin: Theme.unit + (row.depth - 1) * Theme.indentation
    anchors.rightMargin: Theme.unit

    DisclosureArrow {
        row: line.row
    }

    TickBox {
        ticked: line.row.subjectEnabled
        onClicked: line.toggleEnabled()
        Accessible.name: qsTr("Enabled: %1").arg(line.name)

        HoverTip {
            text: line.row.subjectEnabled ? qsTr("Disable") : qsTr("Enable")
        }
    }

    ColourSwatch {
        Layout.leftMargin: Theme.unit / 2
        opacity: line.row.subjectEnabled ? 1 : 0.5
        colour: line.row.colour
    }

    Text {
        id: label

        Layout.fillWidth: true
        Layout.leftMargin: Theme.unit / 2
        visible: !line.row.renaming
        text: line.name
        elide: Text.ElideRight
        color: line.row.subjectEnabled ? Theme.text : Theme.disabledText
        textFormat: Text.PlainText

        HoverTip {
            text: line.name
            offered: label.truncated
        }
    }

    Loader {
        Layout.fillWidth: true
        active: line.row.renaming
        visible: active
        onLoaded: line.row.renameShown(item)
        // qmllint disable unqualified
        sourceComponent: RenameField {
            name: line.name
            check: text => line.row.nameProblem(text)
            onRenamed: text => line.row.renamed(text)
            onClosed: line.row.renameLeft()
        }
        // qmllint enable unqualified
    }

    RowDetails {
        Layout.fillWidth: false
        Layout.maximumWidth: line.width * 0.5
        visible: !line.row.renaming
        row: line.row
    }

    SubjectWarnings {
        row: line.row
    }
}
