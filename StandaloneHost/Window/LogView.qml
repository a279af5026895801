import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore.Panel

/// The log: filtered by channel and severity, at its end until somebody scrolls away from it. Lines are selected by
/// click and Shift+click, and copied with Ctrl+C.
Pane {
    id: view

    required property var host

    readonly property var settings: host.settings
    readonly property var model: host.filteredLog

    signal copied(count: int)

    function copySelected() {
        const all = list.first < 0
        const last = all ? list.count - 1 : list.last
        const first = all ? 0 : list.first
        view.host.copy(view.model.lines(first, last))
        view.copied(last - first + 1)
    }

    padding: 0
    SplitView.minimumHeight: 25 * Theme.unit
    Component.onCompleted: SplitView.preferredHeight = settings.logHeight
    onHeightChanged: {
        if (SplitView.view && SplitView.view.resizing)
            settings.logHeight = height
    }

    background: Rectangle {
        color: Theme.surface
    }

    ColumnLayout {
        anchors.fill: parent
        spacing: 0

        Rectangle {
            color: Theme.header
            implicitHeight: tools.implicitHeight + 2 * Theme.spacing
            Layout.fillWidth: true

            RowLayout {
                id: tools
                anchors.fill: parent
                anchors.margins: Theme.spacing
                anchors.leftMargin: Theme.margin
                spacing: Theme.margin

                Label {
                    text: "Log"
                }

                ComboBox {
                    readonly property var channels: view.host.log.channels

                    model: ["All channels", ...channels]
                    Accessible.name: "Channel"
                    onActivated: index => view.model.channel = index === 0 ? "" : channels[index - 1]
                    // A channel that speaks for the first time changes the places of the others.
                    onModelChanged: currentIndex = 1 + channels.indexOf(view.model.channel)
                }

                ComboBox {
                    model: [
                        { text: "Errors", value: 2 },
                        { text: "Warnings and errors", value: 3 },
                        { text: "Notices and graver", value: 4 },
                        { text: "Everything", value: 7 }
                    ]
                    textRole: "text"
                    valueRole: "value"
                    implicitContentWidthPolicy: ComboBox.WidestText
                    Accessible.name: "Severity"
                    Component.onCompleted: currentIndex = indexOfValue(view.model.severity)
                    onActivated: view.model.severity = currentValue
                }

                Item {
                    Layout.fillWidth: true
                }

                Button {
                    text: "Newest"
                    visible: !list.following
                    onClicked: list.follow()
                    ToolTip.text: "Go to the end of the log and stay there (End)"
                    ToolTip.visible: hovered
                    ToolTip.delay: 600
                }

                Button {
                    text: "Copy"
                    enabled: list.count > 0
                    onClicked: view.copySelected()
                    ToolTip.text: "Copy the selected lines, or all that are shown (Ctrl+C)"
                    ToolTip.visible: hovered
                    ToolTip.delay: 600
                }

                Button {
                    text: "Hide"
                    onClicked: view.settings.logVisible = false
                    ToolTip.text: "Hide the log (Ctrl+L)"
                    ToolTip.visible: hovered
                    ToolTip.delay: 600
                }
            }
        }

        ListView {
            id: list

            /// Whether the newest line is kept in view.
            property bool following: true
            /// Where the selection began and where it ends; -1 for none.
            property int anchorRow: -1
            property int endRow: -1
            readonly property int first: Math.min(anchorRow, endRow)
            readonly property int last: Math.max(anchorRow, endRow)

            readonly property var columns: ({
                time: widthOf("00:00:00.000"), severity: widthOf("warning"), channel: widthOf("SubjectStore")
            })

            function widthOf(text: string): real {
                return Math.ceil(Theme.metrics.advanceWidth(text))
            }

            function follow() {
                following = true
                positionViewAtEnd()
            }

            function select(row: int, extend: bool) {
                endRow = Math.max(0, Math.min(row, count - 1))
                if (!extend || anchorRow < 0)
                    anchorRow = endRow
            }

            function moveTo(row: int, extend: bool) {
                if (count === 0)
                    return
                select(row, extend)
                positionViewAtIndex(endRow, ListView.Contain)
                following = endRow === count - 1
            }

            function forget() {
                anchorRow = -1
                endRow = -1
            }

            Layout.fillWidth: true
            Layout.fillHeight: true
            clip: true
            reuseItems: true
            boundsBehavior: Flickable.StopAtBounds
            activeFocusOnTab: true
            model: view.model
            Accessible.role: Accessible.List
            Accessible.name: "Log"

            // qmllint disable unqualified
            delegate: LogRow {
                required property int index
                required property var model

                width: ListView.view.width
                columns: list.columns
                message: model.text
                selected: index >= list.first && index <= list.last && list.first >= 0
                TapHandler {
                    acceptedModifiers: Qt.NoModifier
                    onTapped: list.tapped(parent.index, false)
                }
                TapHandler {
                    acceptedModifiers: Qt.ShiftModifier
                    onTapped: list.tapped(parent.index, true)
                }
            }
            // qmllint enable unqualified

            function tapped(row: int, extend: bool) {
                forceActiveFocus()
                select(row, extend)
                following = following && atYEnd
            }

            // Only the user ends the following: the contents also move when lines come and go.
            onMovementEnded: following = atYEnd
            onVisibleChanged: if (following) positionViewAtEnd()
            onHeightChanged: if (following) positionViewAtEnd()

            Connections {
                target: view.model

                function onRowsInserted() {
                    if (list.following && !list.moving)
                        Qt.callLater(list.positionViewAtEnd) // qmllint disable type
                }

                function onRowsRemoved(parent, firstGone, lastGone) {
                    const gone = lastGone - firstGone + 1
                    if (firstGone > 0 || gone > list.first)
                        return list.forget()
                    list.anchorRow -= gone
                    list.endRow -= gone
                }

                function onFilterChanged() {
                    list.forget()
                    list.follow()
                }
            }

            Keys.onPressed: event => {
                const extend = (event.modifiers & Qt.ShiftModifier) !== 0
                const page = Math.max(1, Math.floor(height / (Theme.metrics.height * 1.3)) - 1)
                const current = endRow < 0 ? count : endRow
                event.accepted = true
                if (event.matches(StandardKey.Copy))
                    view.copySelected()
                else if (event.matches(StandardKey.SelectAll)) {
                    anchorRow = 0
                    endRow = count - 1
                } else if (event.key === Qt.Key_Up)
                    moveTo(current - 1, extend)
                else if (event.key === Qt.Key_Down)
                    moveTo(current + 1, extend)
                else if (event.key === Qt.Key_PageUp)
                    moveTo(current - page, extend)
                else if (event.key === Qt.Key_PageDown)
                    moveTo(current + page, extend)
                else if (event.key === Qt.Key_Home)
                    moveTo(0, extend)
                else if (event.key === Qt.Key_End)
                    moveTo(count - 1, extend)
                else
                    event.accepted = false
            }

            ScrollBar.vertical: ScrollBar {
                id: scrollBar
                onPressedChanged: if (!pressed) list.following = list.atYEnd
            }

            Label {
                anchors.centerIn: parent
                visible: list.count === 0
                text: view.host.log.channels.length === 0 ? "Nothing has been logged" : "No message is like that"
                color: Theme.disabledText
            }
        }
    }
}
