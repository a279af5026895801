import QtQuick
import QtQuick.Controls

/// A text that is edited in place: Enter or leaving commits it, Esc takes it back. It shows what is committed whenever
/// nobody is typing.
TextField {
    id: field

    property string committed
    /// Why the text is refused; empty when it is not.
    property string problem
    /// Whether a text that is refused is committed all the same.
    property bool commitsRefused: false
    readonly property bool refused: problem !== ""
    property bool typing: false

    signal edited(string text)

    function commit() {
        const text = field.text
        const accepted = !field.refused || field.commitsRefused
        const changed = text !== field.committed
        field.typing = false
        if (changed && accepted)
            field.edited(text)
    }

    implicitHeight: Theme.rowHeight + Theme.unit
    implicitWidth: 30 * Theme.unit
    color: !enabled ? Theme.disabledText : Theme.text
    placeholderTextColor: Theme.secondaryText
    selectionColor: Theme.highlight
    selectedTextColor: Theme.highlightedText
    selectByMouse: true
    leftPadding: Theme.margin
    rightPadding: Theme.margin
    topPadding: 0
    bottomPadding: 0
    verticalAlignment: TextInput.AlignVCenter
    Accessible.description: problem

    onTextEdited: typing = true
    onAccepted: {
        if (!field.refused || field.commitsRefused)
            field.commit()
    }
    onActiveFocusChanged: {
        if (!activeFocus && field.typing)
            field.commit()
    }
    Keys.onEscapePressed: event => {
        event.accepted = field.typing
        field.typing = false
    }

    Binding on text {
        when: !field.typing
        value: field.committed
        restoreMode: Binding.RestoreNone
    }

    background: Rectangle {
        color: field.readOnly || !field.enabled ? Theme.raised : Theme.surface
        radius: Theme.radius
        border.width: field.refused || field.activeFocus ? 2 : 1
        border.color: field.refused ? Theme.critical : field.activeFocus ? Theme.highlight : Theme.line
    }
}
