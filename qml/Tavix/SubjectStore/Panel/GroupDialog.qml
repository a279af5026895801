import QtQuick
import QtQuick.Layouts

/// Asks for the name of a new group.
PanelDialog {
    id: dialog

    /// From the name to a result.
    property var deed: name => ({ "failed": false, "reason": "" })

    function ask(head: string, action: var) {
        title = head
        deed = action
        name.text = ""
        show(name)
    }

    acceptText: qsTr("Create")
    acceptable: name.text.trim() !== ""
    onCommitted: finish(deed.call(null, name.text.trim()))

    NameField {
        id: name

        Layout.fillWidth: true
        placeholderText: qsTr("Name of the group")
        focus: true
        Accessible.name: qsTr("Name of the group")
    }
}
