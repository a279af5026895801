import QtQuick
import QtQuick.Controls
import QtQuick.Layouts

/// Objects that another is like, with the distance of the match. The arrow keys walk, Enter or a click activates.
Column {
    id: list

    required property var panel
    /// {id, name, distance}, and `other` where the pair is told.
    property var matches: []
    property var chosen: null
    readonly property real threshold: panel && panel.evaluation ? panel.evaluation.warningThreshold : 0
    property string activation: qsTr("Show its markers as rings")

    /// The row that Tab comes to.
    property int entry: 0

    signal activated(var match)

    // The store tells of changes often; rows that say the same stay, and keep the focus.
    property var shown: []
    onMatchesChanged: {
        const text = match => [match.id, match.name, match.other, match.distance].join()
        if (list.matches.map(text).join("\n") !== list.shown.map(text).join("\n"))
            list.shown = list.matches
        list.entry = Math.max(0, Math.min(list.entry, list.shown.length - 1))
    }

    Repeater {
        id: rows

        model: list.shown

        // qmllint disable unqualified
        ItemDelegate {
            id: row

            required property var modelData
            required property int index
            readonly property bool current: list.chosen !== null && modelData.id.equals(list.chosen)
            readonly property bool critical: list.threshold > 0 && modelData.distance < list.threshold / 2
            readonly property string pair: modelData.other ? qsTr("%1 with %2").arg(modelData.name).arg(modelData.other) : modelData.name
            readonly property string distance: qsTr("%1 mm").arg(modelData.distance.toFixed(1))

            width: list.width
            height: Theme.rowHeight + Theme.unit
            leftPadding: Theme.margin
            rightPadding: Theme.margin
            topPadding: 0
            bottomPadding: 0
            focusPolicy: index === list.entry ? Qt.StrongFocus : Qt.ClickFocus
            Accessible.name: qsTr("%1, %2 apart").arg(pair).arg(distance)
            Accessible.description: list.activation
            onActiveFocusChanged: {
                if (activeFocus)
                    list.entry = row.index
            }
            onClicked: list.activated(row.modelData)
            Keys.onReturnPressed: row.clicked()
            Keys.onEnterPressed: row.clicked()
            Keys.onUpPressed: event => event.accepted = list.step(row.index - 1)
            Keys.onDownPressed: event => event.accepted = list.step(row.index + 1)

            contentItem: RowLayout {
                spacing: Theme.margin

                Rectangle {
                    implicitWidth: Theme.unit * 2
                    implicitHeight: Theme.unit * 2
                    radius: width / 2
                    color: row.critical ? Theme.critical : Theme.warning
                }
                ElidedLabel {
                    Layout.fillWidth: true
                    text: row.pair
                }
                Label {
                    text: row.distance
                    color: row.critical ? Theme.critical : Theme.warning
                }
            }
            background: Rectangle {
                radius: Theme.radius
                color: row.current ? Theme.selected : row.hovered ? Theme.hovered : "transparent"
                border.width: row.visualFocus ? 2 : 0
                border.color: Theme.highlight
            }
        }
        // qmllint enable unqualified
    }

    function step(index: int): bool {
        const row = rows.itemAt(index)
        if (!row)
            return false
        row.forceActiveFocus(Qt.TabFocusReason)
        return true
    }
}
