import QtQuick
import Tavix.SubjectStore

/// What can be added to the stage.
PanelMenu {
    id: owner

    required property PanelActions actions

    onAboutToShow: ++actions.openMenus
    onClosed: --actions.openMenus

    PanelMenuItem {
        action: owner.actions.addBasic
        offered: owner.actions.has(SubjectStoreFeatures.BasicObject)
    }

    PanelMenuItem {
        action: owner.actions.addSmart
        offered: owner.actions.has(SubjectStoreFeatures.SmartObject)
    }

    PanelMenuItem {
        action: owner.actions.addFromDevices
        offered: owner.actions.has(SubjectStoreFeatures.SmartObject)
    }

    PanelMenuItem {
        action: owner.actions.addCharacter
        offered: owner.actions.has(SubjectStoreFeatures.CharacterFromClusters)
    }

    PanelMenuSeparator {}

    PanelMenuItem {
        action: owner.actions.importSubject
    }

    PanelMenuItem {
        action: owner.actions.importMesh
        offered: owner.actions.has(SubjectStoreFeatures.SceneMesh)
    }
}
