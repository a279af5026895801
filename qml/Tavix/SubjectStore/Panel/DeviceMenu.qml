import QtQuick

/// The devices that a cluster can be linked to.
PanelMenu {
    id: owner

    required property var panel
    property string device

    signal chosen(string urn)

    /// What is ticked is the store's: a click ticks nothing by itself.
    function choose(line: PanelMenuItem, urn: string) {
        line.checked = Qt.binding(() => urn === owner.device)
        owner.chosen(urn)
    }

    title: qsTr("Device")

    PanelMenuItem {
        text: qsTr("None")
        checkable: true
        checked: owner.device === ""
        onTriggered: owner.choose(this, "")
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
            onTriggered: owner.choose(this, urn)
        }
        // qmllint enable unqualified
    }
}
