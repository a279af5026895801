import QtQuick

/// The devices that a cluster can be linked to.
PanelMenu {
    id: owner

    required property var panel
    property string device

    signal chosen(string urn)

    title: qsTr("Device")

    PanelMenuItem {
        text: qsTr("None")
        checkable: true
        checked: owner.device === ""
        onTriggered: owner.chosen("")
    }

    Repeater {
        model: owner.panel ? owner.panel.devices : null
        // qmllint disable unqualified
        delegate: PanelMenuItem {
            required property string urn
            required property string linkedTo

            text: linkedTo !== "" && urn !== owner.device ? qsTr("%1 (%2)").arg(urn).arg(linkedTo) : urn
            checkable: true
            checked: urn === owner.device
            onTriggered: owner.chosen(urn)
        }
        // qmllint enable unqualified
    }
}
