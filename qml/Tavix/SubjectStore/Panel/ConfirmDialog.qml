import QtQuick
import QtQuick.Controls
import QtQuick.Layouts

/// Asks before something is done that cannot be undone, with an option if there is one.
PanelDialog {
    id: dialog

    property string question
    /// The text of a check box; none when empty.
    property string option
    property alias optionChosen: choice.checked
    /// What is done when the answer is yes: from the option to a result.
    property var deed: () => ({ "failed": false, "reason": "" })

    function ask(head: string, sentence: string, yes: string, optionText: string, action: var) {
        title = head
        question = sentence
        acceptText = yes
        option = optionText
        choice.checked = false
        deed = action
        show(null)
    }

    onCommitted: finish(deed.call(null, choice.visible && choice.checked))

    Text {
        Layout.fillWidth: true
        text: dialog.question
        wrapMode: Text.Wrap
        maximumLineCount: 8
        elide: Text.ElideRight
        color: Theme.text
        textFormat: Text.PlainText
    }

    CheckBox {
        id: choice

        Layout.fillWidth: true
        visible: dialog.option !== ""
        text: dialog.option
    }
}
