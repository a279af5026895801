import QtQuick
import QtQuick.Controls

/// The names of pages, in as many lines as they need. One stop for Tab; the arrow keys, Home and End choose.
FocusScope {
    id: strip

    /// {name, text, busy}
    required property var pages
    property int currentIndex: 0

    function choose(index: int) {
        strip.currentIndex = Math.max(0, Math.min(strip.pages.length - 1, index))
    }

    implicitHeight: flow.implicitHeight + Theme.spacing
    activeFocusOnTab: true
    Accessible.role: Accessible.PageTabList
    Keys.onLeftPressed: choose(currentIndex - 1)
    Keys.onRightPressed: choose(currentIndex + 1)
    Keys.onPressed: event => {
        event.accepted = event.key === Qt.Key_Home || event.key === Qt.Key_End
        if (event.accepted)
            strip.choose(event.key === Qt.Key_Home ? 0 : strip.pages.length - 1)
    }

    Rectangle {
        anchors.fill: parent
        color: Theme.header

        Rectangle {
            anchors.left: parent.left
            anchors.right: parent.right
            anchors.bottom: parent.bottom
            height: 1
            color: Theme.line
        }
    }
    Flow {
        id: flow

        anchors {
            left: parent.left
            right: parent.right
            top: parent.top
            leftMargin: Theme.spacing
            topMargin: Theme.spacing
        }

        Repeater {
            model: strip.pages

            // qmllint disable unqualified
            AbstractButton {
                id: tab

                required property var modelData
                required property int index
                readonly property bool current: strip.currentIndex === index

                height: Theme.rowHeight + Theme.unit
                leftPadding: 1.5 * Theme.spacing
                rightPadding: 1.5 * Theme.spacing
                text: modelData.text
                focusPolicy: Qt.NoFocus
                hoverEnabled: true
                Accessible.role: Accessible.PageTab
                Accessible.name: modelData.busy ? qsTr("%1, running").arg(text) : text
                Accessible.selected: current
                onClicked: {
                    strip.currentIndex = tab.index
                    strip.forceActiveFocus(Qt.MouseFocusReason)
                }

                contentItem: Row {
                    spacing: Theme.spacing

                    Text {
                        anchors.verticalCenter: parent.verticalCenter
                        text: tab.text
                        color: tab.current || tab.hovered ? Theme.text : Theme.secondaryText
                    }
                    Rectangle {
                        anchors.verticalCenter: parent.verticalCenter
                        visible: tab.modelData.busy
                        width: 2 * Theme.unit
                        height: width
                        radius: width / 2
                        color: Theme.running
                    }
                }
                background: Item {
                    Rectangle {
                        anchors.fill: parent
                        anchors.margins: 2
                        visible: tab.current && strip.activeFocus
                        radius: Theme.radius
                        color: "transparent"
                        border.width: 2
                        border.color: Theme.highlight
                    }
                    Rectangle {
                        anchors.left: parent.left
                        anchors.right: parent.right
                        anchors.bottom: parent.bottom
                        height: 3
                        color: tab.current ? Theme.highlight : tab.hovered ? Theme.line : "transparent"
                    }
                }
            }
            // qmllint enable unqualified
        }
    }
}
