import QtQuick
import QtQuick.Controls
import QtQuick.Layouts

/// Search, what is shown, and what can be added.
Rectangle {
    id: bar

    required property PanelActions actions

    readonly property var rows: actions.rows

    signal leftSearch

    function focusSearch() {
        search.forceActiveFocus()
        search.selectAll()
    }

    implicitHeight: content.implicitHeight + 2 * Theme.unit
    color: Theme.header

    RowLayout {
        id: content

        anchors.fill: parent
        anchors.margins: Theme.unit
        spacing: Theme.unit / 2

        TextField {
            id: search

            Layout.fillWidth: true
            Layout.minimumWidth: 6 * Theme.unit
            Layout.rightMargin: Theme.unit / 2
            implicitHeight: Theme.rowHeight + Theme.unit
            text: bar.rows ? bar.rows.search : ""
            placeholderText: qsTr("Search")
            selectByMouse: true
            color: Theme.text
            placeholderTextColor: Theme.secondaryText
            selectionColor: Theme.highlight
            selectedTextColor: Theme.highlightedText
            leftPadding: Theme.iconSize + 2 * Theme.unit
            rightPadding: clear.visible ? clear.width : Theme.unit
            topPadding: 0
            bottomPadding: 0
            verticalAlignment: TextInput.AlignVCenter
            Accessible.name: qsTr("Search subjects")
            onTextEdited: pause.restart()
            Keys.onEscapePressed: text === "" ? bar.leftSearch() : bar.clearSearch()
            Keys.onDownPressed: bar.applySearch(true)
            onAccepted: bar.applySearch(true)

            HoverTip {
                text: qsTr("Search by name, slot or device (Ctrl+F)")
                offered: !search.activeFocus
            }

            background: Rectangle {
                radius: Theme.radius
                color: Theme.surface
                border.width: search.activeFocus ? 2 : 1
                border.color: search.activeFocus ? Theme.highlight : Theme.line
            }

            Icon {
                x: Theme.unit
                anchors.verticalCenter: parent.verticalCenter
                name: "search"
                colour: Theme.secondaryText
            }

            IconButton {
                id: clear

                anchors.right: parent.right
                anchors.verticalCenter: parent.verticalCenter
                visible: search.text !== ""
                focusPolicy: Qt.NoFocus
                symbol: "close"
                tip: qsTr("Clear the search (Esc)")
                onClicked: bar.clearSearch()
            }

            Timer {
                id: pause

                interval: 120
                onTriggered: bar.applySearch(false)
            }
        }

        IconButton {
            symbol: "warning"
            action: bar.actions.onlyWarnings
            colour: checked ? Theme.warning : Theme.text
        }

        IconButton {
            symbol: "expand"
            action: bar.actions.expandAll
        }

        IconButton {
            symbol: "collapse"
            action: bar.actions.collapseAll
        }

        IconButton {
            id: add

            symbol: "plus"
            tip: qsTr("Add or import")
            down: pressed || menu.visible
            onClicked: menu.popup(add, 0, add.height)

            AddMenu {
                id: menu

                actions: bar.actions
            }
        }
    }

    Rectangle {
        anchors.bottom: parent.bottom
        width: parent.width
        height: 1
        color: Theme.line
    }

    function applySearch(leave: bool) {
        pause.stop()
        if (rows)
            rows.search = search.text
        if (leave)
            leftSearch()
    }

    function clearSearch() {
        search.clear()
        applySearch(false)
    }

    /// Nothing is left out of the list any more.
    function showEverything() {
        clearSearch()
        rows.onlyWarnings = false
    }
}
