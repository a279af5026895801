import QtQuick
import QtQuick.Controls
import QtQuick.Layouts

/// A question in the middle of the window. It closes when its answer was carried out; what fails is told in it.
Dialog {
    id: dialog

    property string acceptText: qsTr("OK")
    property bool acceptable: true
    /// Why the last try failed.
    property string failure
    property real preferredWidth: 20 * Theme.rowHeight / 1.4

    /// What had the focus, and gets it back.
    property Item before

    default property alias form: questions.data

    /// To be answered with `finish`.
    signal committed

    /// Opens with the focus on an item of the form. Not at once: a menu that asks closes first, and with it goes what has
    /// the focus now.
    function show(first: Item) {
        Qt.callLater(() => { // qmllint disable
            open()
            if (first)
                first.forceActiveFocus()
        })
    }

    function commit() {
        if (acceptable)
            committed()
    }

    function tell(result: var) {
        failure = result.failed ? result.reason || result.name : ""
    }

    function finish(result: var) {
        tell(result)
        if (!result.failed)
            close()
    }

    parent: Overlay.overlay
    anchors.centerIn: parent
    width: Math.min(preferredWidth, parent ? parent.width - 4 * Theme.margin : preferredWidth)
    modal: true
    focus: true
    padding: 2 * Theme.margin
    onAboutToShow: {
        failure = ""
        before = parent.Window.activeFocusItem
    }
    onClosed: {
        if (before)
            before.forceActiveFocus()
    }
    onOpened: {
        if (!questions.activeFocus)
            accept.forceActiveFocus(Qt.TabFocusReason)
    }

    background: Rectangle {
        color: Theme.window
        border.color: Theme.line
        radius: 2 * Theme.radius
    }
    header: Text {
        padding: 2 * Theme.margin
        bottomPadding: 0
        text: dialog.title
        elide: Text.ElideRight
        color: Theme.text
        font.bold: true
        textFormat: Text.PlainText
    }
    // qmllint disable deferred-property-id
    contentItem: ColumnLayout {
        spacing: Theme.margin
        Keys.onReturnPressed: dialog.commit()
        Keys.onEnterPressed: dialog.commit()

        ColumnLayout {
            id: questions

            Layout.fillWidth: true
            spacing: Theme.margin
        }

        Text {
            Layout.fillWidth: true
            visible: dialog.failure !== ""
            text: dialog.failure
            wrapMode: Text.Wrap
            color: Theme.critical
            textFormat: Text.PlainText
        }
    }
    footer: RowLayout {
        spacing: Theme.margin

        Item {
            Layout.fillWidth: true
        }

        PanelButton {
            Layout.bottomMargin: 2 * Theme.margin
            text: qsTr("Cancel")
            onClicked: dialog.reject()
        }

        PanelButton {
            id: accept

            Layout.bottomMargin: 2 * Theme.margin
            Layout.rightMargin: 2 * Theme.margin
            text: dialog.acceptText
            highlighted: true
            enabled: dialog.acceptable
            onClicked: dialog.commit()
        }
    }
}
