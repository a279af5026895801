import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore.Panel

/// One message of the log.
ItemDelegate {
    id: row

    required property string time
    required property int severity
    required property string severityName
    required property string channel
    required property string message

    /// The widths of all columns but the last.
    required property var columns
    property bool selected

    height: Math.round(Theme.metrics.height * 1.3)
    padding: 0
    hoverEnabled: true
    Accessible.name: severityName + ", " + channel + ": " + message

    readonly property color foreground: selected ? Theme.highlightedText : Theme.text
    readonly property color faint: selected ? Theme.highlightedText : Theme.secondaryText

    contentItem: Row {
        leftPadding: Theme.margin
        spacing: Theme.margin

        Text {
            text: row.time
            width: row.columns.time
            font: row.font
            color: row.faint
            anchors.verticalCenter: parent.verticalCenter
        }
        Text {
            text: row.severityName
            width: row.columns.severity
            font: row.font
            color: row.selected ? Theme.highlightedText : row.severity <= 2 ? Theme.critical
                                                        : row.severity === 3 ? Theme.warning : Theme.secondaryText
            anchors.verticalCenter: parent.verticalCenter
        }
        Text {
            text: row.channel
            width: row.columns.channel
            font: row.font
            color: row.faint
            elide: Text.ElideRight
            anchors.verticalCenter: parent.verticalCenter
        }
        Text {
            text: row.message
            textFormat: Text.PlainText
            width: row.width - x - Theme.margin
            font: row.font
            color: row.foreground
            elide: Text.ElideRight
            maximumLineCount: 1
            ToolTip.text: row.message
            ToolTip.visible: row.hovered && truncated
            ToolTip.delay: 600
            anchors.verticalCenter: parent.verticalCenter
        }
    }

    background: Rectangle {
        color: row.selected ? Theme.highlight : row.hovered ? Theme.hovered : "transparent"
    }
}
