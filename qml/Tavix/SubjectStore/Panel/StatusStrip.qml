import QtQuick
import QtQuick.Layouts
import Tavix.SubjectStore

/// How many subjects there are, and how far object evaluation has come while it runs.
Rectangle {
    id: strip

    required property var panel

    readonly property var rows: panel ? panel.rows : null
    readonly property int total: rows ? rows.totalCount : 0
    readonly property int shown: rows ? rows.shownCount : 0
    readonly property int selected: panel ? panel.selectedSubjects.length : 0
    readonly property double done: SubjectStore.objectEvaluationProgressDone
    readonly property double required: SubjectStore.objectEvaluationProgressRequired
    readonly property bool running: required > 0 && done < required

    implicitHeight: Theme.rowHeight
    color: Theme.header

    Rectangle {
        width: parent.width
        height: 1
        color: Theme.line
    }

    RowLayout {
        anchors.fill: parent
        anchors.leftMargin: Theme.margin
        anchors.rightMargin: Theme.margin
        spacing: Theme.margin

        Text {
            Layout.fillWidth: true
            text: {
                const all = strip.shown === strip.total ? qsTr("%1 subjects").arg(strip.total) : qsTr("%1 of %2 subjects").arg(strip.shown).arg(strip.total)
                return strip.selected > 0 ? qsTr("%1, %2 selected").arg(all).arg(strip.selected) : all
            }
            elide: Text.ElideRight
            color: Theme.secondaryText
            font.pixelSize: Theme.smallFont
        }

        Text {
            visible: strip.running && strip.width > 22 * Theme.rowHeight
            text: qsTr("Evaluating objects")
            color: Theme.secondaryText
            font.pixelSize: Theme.smallFont
        }

        Rectangle {
            Layout.preferredWidth: Math.min(5 * Theme.rowHeight, strip.width * 0.22)
            implicitHeight: Math.max(4, Theme.unit)
            visible: strip.running
            radius: height / 2
            color: Theme.line
            Accessible.role: Accessible.ProgressBar
            Accessible.name: qsTr("Object evaluation, %1 %").arg(Math.floor(100 * strip.done / strip.required))

            Rectangle {
                width: parent.width * Math.min(1, strip.done / Math.max(1, strip.required))
                height: parent.height
                radius: parent.radius
                color: Theme.running
            }

            HoverTip {
                text: qsTr("%L1 of %L2 comparisons").arg(strip.done).arg(strip.required)
            }
        }

        Text {
            visible: strip.running
            text: Math.floor(100 * strip.done / Math.max(1, strip.required)) + " %"
            color: Theme.secondaryText
            font.pixelSize: Theme.smallFont
        }
    }
}
