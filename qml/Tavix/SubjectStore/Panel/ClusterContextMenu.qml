import QtQuick

/// The pattern and the device of a cluster.
PanelMenu {
    id: owner

    required property var panel
    required property PanelActions actions
    property var subject
    property int cluster
    property int pattern
    property string device

    PanelMenuItem {
        text: qsTr("Pattern…")
        onTriggered: owner.actions.dialogs.repattern(owner.subject, owner.cluster, owner.pattern)
    }

    PanelMenuItem {
        text: qsTr("No pattern")
        enabled: owner.pattern > 0
        onTriggered: owner.actions.tell(owner.panel.setClusterPattern(owner.subject, owner.cluster, 0))
    }

    DeviceMenu {
        panel: owner.panel
        device: owner.device
        onChosen: urn => owner.actions.tell(owner.panel.setClusterDevice(owner.subject, owner.cluster, urn))
    }
}
