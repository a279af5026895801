import QtQuick

/// Takes a new name in place of the old one: Enter accepts it, Escape leaves it.
NameField {
    id: field

    property string name
    /// From a text to what is wrong with it.
    property var check: () => ""
    property bool over

    signal renamed(string text)
    signal closed

    function finish(accept: bool) {
        if (over || (accept && problem !== ""))
            return
        over = true
        if (accept && text !== name)
            renamed(text)
        closed()
    }

    /// Accepts a good name when somebody goes elsewhere; but when only the row goes, nobody has decided anything.
    function leave() {
        if (!activeFocus && parent)
            finish(problem === "")
    }

    text: name
    problem: text === name ? "" : check.call(null, text)
    Accessible.name: qsTr("New name")
    onAccepted: finish(true)
    onActiveFocusChanged: soon.running = !activeFocus
    Keys.onEscapePressed: finish(false)
    // The list moves its current row by these.
    Keys.onUpPressed: event => event.accepted = true
    Keys.onDownPressed: event => event.accepted = true
    Component.onCompleted: {
        forceActiveFocus()
        selectAll()
    }

    Timer {
        id: soon

        interval: 0
        onTriggered: field.leave()
    }

    Tip {
        visible: field.problem !== ""
        delay: 0
        y: field.height + Theme.unit / 2
        text: field.problem
    }
}
