import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore

/// The operator's panel: the subjects of the stage, and what can be seen and changed of those that are selected.
Item {
    id: root

    // qmllint disable unqualified
    property var panel: typeof rootContextSubjectPanel === "undefined" ? null : rootContextSubjectPanel
    // qmllint enable unqualified

    readonly property bool wide: width > 26 * Theme.rowHeight

    PanelDialogs {
        id: questions

        anchors.fill: parent
        panel: root.panel
        onDone: result => commands.tell(result)
        onAdded: name => {
            message.clear()
            const made = SubjectStore.subjects().find(id => SubjectStore.subjectName(id) === name)
            if (made)
                commands.revealWanted(made)
        }
    }

    PanelActions {
        id: commands

        panel: root.panel
        dialogs: questions
        onTold: sentence => message.text = sentence
        onSearchWanted: bar.focusSearch()
    }

    WarningSummary {
        id: summary
    }

    Rectangle {
        anchors.fill: parent
        color: Theme.window
    }

    ColumnLayout {
        anchors.fill: parent
        spacing: 0

        SubjectToolBar {
            id: bar

            Layout.fillWidth: true
            actions: commands
            onLeftSearch: list.forceActiveFocus()
        }

        InlineMessage {
            id: message

            Layout.fillWidth: true
        }

        SplitView {
            id: split

            Layout.fillWidth: true
            Layout.fillHeight: true
            orientation: root.wide ? Qt.Horizontal : Qt.Vertical
            handle: Rectangle {
                id: grip

                implicitWidth: Theme.unit
                implicitHeight: Theme.unit
                color: SplitHandle.hovered || SplitHandle.pressed ? Theme.highlight : Theme.line

                // The view has set the size across; when it turns, that has to go.
                Connections {
                    target: split // qmllint disable unqualified

                    function onOrientationChanged() {
                        grip.width = undefined
                        grip.height = undefined
                    }
                }
            }

            Rectangle {
                SplitView.fillWidth: true
                SplitView.fillHeight: true
                SplitView.minimumWidth: 8 * Theme.rowHeight
                SplitView.minimumHeight: 6 * Theme.rowHeight
                color: Theme.surface

                SubjectList {
                    id: list

                    anchors.fill: parent
                    panel: root.panel
                    actions: commands
                    onFilterInTheWay: bar.showEverything()
                    onWarningsWanted: (badge, warnings) => summary.show(badge, warnings)
                }

                EmptyState {
                    anchors.horizontalCenter: parent.horizontalCenter
                    y: Math.max(0, Math.min(list.contentHeight + 2 * Theme.rowHeight, parent.height - height - Theme.margin))
                    width: Math.min(parent.width - 4 * Theme.margin, 16 * Theme.rowHeight)
                    visible: list.rows !== null && list.rows.shownCount === 0
                    rows: list.rows
                    onClearWanted: bar.showEverything()
                }
            }

            Loader {
                id: inspector

                SplitView.preferredWidth: Math.max(12 * Theme.rowHeight, root.width * 0.42)
                SplitView.preferredHeight: root.height * 0.45
                SplitView.minimumWidth: 10 * Theme.rowHeight
                SplitView.minimumHeight: 4 * Theme.rowHeight
                visible: status === Loader.Ready
                Component.onCompleted: setSource("Inspector.qml", {
                    "panel": Qt.binding(() => root.panel)
                })
            }
        }

        StatusStrip {
            Layout.fillWidth: true
            panel: root.panel
        }
    }
}
