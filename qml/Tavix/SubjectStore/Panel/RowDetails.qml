import QtQuick
import QtQuick.Layouts
import Tavix.SubjectStore

/// What is worth seeing of a subject at a glance; it depends on the kind.
RowLayout {
    id: details

    required property var row

    readonly property bool calibrated: row.subjectCalibration === SubjectCalibration.Calibrated
    readonly property var linked: row.devices.filter(device => device !== "")
    readonly property string device: linked.length > 1 ? qsTr("%1 devices").arg(linked.length) : linked.length === 1 ? linked[0] : ""
    readonly property string note: [row.linkedCamera, row.fileName, row.preset, row.width > 20 * Theme.rowHeight ? device : ""].filter(part => part !== "").join(" · ")

    spacing: Theme.margin
    clip: true

    Text {
        Layout.fillWidth: true
        visible: text !== "" && details.row.width > 11 * Theme.rowHeight
        text: details.note
        elide: Text.ElideMiddle
        horizontalAlignment: Text.AlignRight
        color: Theme.secondaryText
        font.pixelSize: Theme.smallFont
        textFormat: Text.PlainText
    }

    PatternChips {
        visible: details.row.patterns.length > 0
        patterns: details.row.patterns
        most: details.row.width < 12 * Theme.rowHeight ? 2 : 4
    }

    StatusDot {
        visible: details.row.calibratable
        hollow: details.row.subjectCalibration === SubjectCalibration.Uncalibrated
        colour: details.calibrated ? Theme.good : hollow ? Theme.secondaryText : Theme.running
        text: details.calibrated ? qsTr("Calibrated") : hollow ? qsTr("Not calibrated") : qsTr("Calibrating…")
    }
}
