import QtQuick

/// What can be done with a whole section.
PanelMenu {
    id: owner

    required property PanelActions actions
    property string key

    PanelMenuItem {
        readonly property PanelAction add: ({
                "BasicObjects": owner.actions.addBasic,
                "SmartObjects": owner.actions.addSmart,
                "CFCs": owner.actions.addCharacter,
                "SceneMeshes": owner.actions.importMesh
            })[owner.key] ?? owner.actions.importSubject

        text: add === owner.actions.importMesh || add === owner.actions.importSubject ? add.text : qsTr("Add %1").arg(add.text.charAt(0).toLowerCase() + add.text.slice(1))
        onTriggered: add.trigger()
    }

    PanelMenuItem {
        offered: owner.key === "SmartObjects"
        action: owner.actions.assignPatterns
    }

    PanelMenuItem {
        offered: owner.key === "SmartObjects"
        action: owner.actions.autoPatterns
    }

    PanelMenuSeparator {}

    PanelMenuItem {
        action: owner.actions.enableAll
    }

    PanelMenuItem {
        action: owner.actions.disableAll
    }

    PanelMenuSeparator {}

    PanelMenuItem {
        action: owner.actions.expandAll
    }

    PanelMenuItem {
        action: owner.actions.collapseAll
    }
}
