import QtQuick
import QtQuick.Layouts

/// A cluster with its device and pattern, or a marker with its place.
RowLayout {
    id: line

    required property var row

    readonly property bool cluster: row.devices.length > 0
    readonly property string device: cluster ? row.devices[0] : ""
    readonly property var place: row.markers.length > 0 ? row.markers[0] : null

    spacing: Theme.margin
    anchors.leftMargin: Theme.nameMargin
    anchors.rightMargin: Theme.unit

    Text {
        Layout.fillWidth: true
        text: line.row.subjectName
        elide: Text.ElideRight
        color: Theme.text
        textFormat: Text.PlainText
    }

    Text {
        id: detail

        Layout.maximumWidth: line.width * 0.72
        Layout.rightMargin: line.cluster || line.width < 12 * Theme.rowHeight ? 0 : Theme.badgeWidth + Theme.spacing
        text: line.cluster ? line.device || qsTr("no device") : line.place ? qsTr("%1, %2, %3 mm").arg(line.place.x.toFixed(1)).arg(line.place.y.toFixed(1)).arg(line.place.z.toFixed(1)) : ""
        elide: Text.ElideMiddle
        color: line.cluster && line.device === "" ? Theme.disabledText : Theme.secondaryText
        font.italic: line.cluster && line.device === ""
        font.pixelSize: Theme.smallFont
        textFormat: Text.PlainText

        HoverTip {
            text: detail.text
            offered: detail.truncated
        }
    }

    PatternChip {
        Layout.rightMargin: Theme.badgeWidth + Theme.spacing
        visible: line.cluster
        pattern: line.row.patterns.length > 0 ? line.row.patterns[0] : 0
    }
}
