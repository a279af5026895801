import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore.Panel

/// Tells something that has to be read, or asks whether to go on.
HostDialog {
    id: box

    property string text
    property string answer
    property var action: null
    property bool agreed: false

    function tell(title: string, text: string) {
        box.title = title
        box.text = text
        box.action = null
        box.open()
    }

    function ask(title: string, text: string, answer: string, action: var) {
        box.title = title
        box.text = text
        box.answer = answer
        box.action = action
        box.open()
    }

    onOpened: {
        agreed = false
        close.forceActiveFocus() // what is asked cannot be undone
    }
    onAccepted: agreed = true
    // Not before: what is done then may have something to tell.
    onClosed: {
        if (agreed)
            action.call(null)
    }

    contentItem: Label {
        text: box.text
        wrapMode: Text.Wrap
        textFormat: Text.PlainText
    }

    footer: DialogButtonBox {
        background: null
        padding: Theme.margin

        Button {
            id: agree
            text: box.answer
            visible: box.action !== null
            DialogButtonBox.buttonRole: DialogButtonBox.AcceptRole // qmllint disable type
            Keys.onReturnPressed: clicked()
            Keys.onEnterPressed: clicked()
        }
        Button {
            id: close
            text: box.action ? "Cancel" : "Close"
            DialogButtonBox.buttonRole: DialogButtonBox.RejectRole // qmllint disable type
            Keys.onReturnPressed: clicked()
            Keys.onEnterPressed: clicked()
        }
    }
}
