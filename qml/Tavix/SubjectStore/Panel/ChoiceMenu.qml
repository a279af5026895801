import QtQuick

/// A submenu of names to choose one from.
PanelMenu {
    id: owner

    /// Of {name, value}.
    property var choices: []
    property bool hasCurrent
    property var current
    /// Told when there is nothing to choose.
    property string nothing

    signal chosen(var value)

    // qmllint disable unqualified
    Repeater {
        model: owner.choices
        delegate: PanelMenuItem {
            required property var modelData

            text: modelData.name
            checkable: checked
            checked: owner.hasCurrent && modelData.value !== undefined && owner.current === modelData.value
            onTriggered: owner.chosen(modelData.value)
        }
    }

    Repeater {
        model: owner.choices.length === 0 && owner.nothing !== "" ? 1 : 0
        delegate: PanelMenuItem {
            text: owner.nothing
            enabled: false
        }
    }
    // qmllint enable unqualified
}
