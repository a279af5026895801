import QtQuick
import QtQuick.Layouts

/// The heading of a kind of subject.
Rectangle {
    id: section

    required property var row

    signal warningsWanted(Item badge)

    color: row.hovered ? Theme.hovered : Theme.header

    Rectangle {
        anchors.bottom: parent.bottom
        width: parent.width
        height: 1
        color: Theme.line
    }

    RowLayout {
        anchors.fill: parent
        anchors.leftMargin: Theme.unit
        anchors.rightMargin: Theme.unit
        spacing: Theme.spacing

        DisclosureArrow {
            row: section.row
        }

        Text {
            Layout.fillWidth: true
            text: section.row.sectionName
            elide: Text.ElideRight
            color: section.row.count > 0 ? Theme.text : Theme.secondaryText
            font.bold: true
            textFormat: Text.PlainText
        }

        WarningBadge {
            count: section.row.warningCount
            tip: section.row.sectionWarnings.map(warning => warning.text).join("\n")
            onClicked: section.warningsWanted(this)
        }

        Text {
            Layout.minimumWidth: Theme.badgeWidth
            horizontalAlignment: Text.AlignRight
            text: section.row.matchCount === section.row.count ? section.row.count : qsTr("%1 of %2").arg(section.row.matchCount).arg(section.row.count)
            color: Theme.secondaryText
        }
    }
}
