import QtQuick
import Tavix.SubjectStore

/// Every command for the selected subjects. What their kind does not have is not listed.
PanelMenu {
    id: owner

    required property var panel
    required property PanelActions actions
    /// The subject of the row on which the menu was opened.
    property var subject

    readonly property var ids: actions.ids

    function askGroup(head: string, set: var) {
        const members = actions.objectIds
        actions.dialogs.group.ask(head, name => set(members, name))
    }

    onClosed: {
        --actions.openMenus
        actions.release()
    }
    onAboutToShow: {
        ++actions.openMenus
        actions.hold()
        proximity.groups = panel.proximityGroups()
        proximity.current = panel.proximityGroup(subject)
        templates.groups = panel.templateGroups()
        templates.current = panel.templateGroup(subject)
        slots.choices = panel.slotsFor(subject).map(slot => ({
                    "name": slot.name,
                    "value": slot.item
                }))
        slots.enabled = slots.choices.length > 0
    }

    PanelMenuItem {
        action: owner.actions.toggle
    }

    PanelMenuItem {
        action: owner.actions.enable
        offered: owner.ids.length > 1
    }

    PanelMenuItem {
        action: owner.actions.disable
        offered: owner.ids.length > 1
    }

    PanelMenuItem {
        action: owner.actions.rename
    }

    PanelMenuItem {
        action: owner.actions.recolour
    }

    GroupMenu {
        id: proximity

        title: qsTr("Proximity group")
        enabled: owner.actions.objects && owner.actions.has(SubjectStoreFeatures.ProximityGrouping)
        onGroupChosen: group => owner.actions.tell(owner.panel.setProximityGroup(owner.actions.objectIds, group))
        onNewWanted: owner.askGroup(qsTr("New proximity group"), (members, name) => owner.panel.setProximityGroup(members, name))
    }

    GroupMenu {
        id: templates

        title: qsTr("Template group")
        enabled: owner.actions.objects
        onGroupChosen: group => owner.actions.tell(owner.panel.setTemplateGroup(owner.actions.objectIds, group))
        onNewWanted: owner.askGroup(qsTr("New template group"), (members, name) => owner.panel.setTemplateGroup(members, name))
    }

    PanelMenu {
        id: presets

        title: qsTr("Apply preset")
        enabled: owner.actions.objects && owner.actions.has(SubjectStoreFeatures.ObjectPreset) && presetItems.count > 0

        Repeater {
            id: presetItems

            model: SubjectStore.objectPresetModel
            // qmllint disable unqualified
            delegate: PanelMenuItem {
                required property var model

                text: model.name
                onTriggered: owner.actions.tell(owner.panel.applyPreset(model.storeId, owner.actions.objectIds))
            }
            // qmllint enable unqualified
        }
    }

    PanelMenuSeparator {
        offered: owner.actions.objects
    }

    ChoiceMenu {
        id: slots

        title: qsTr("Assign to slot")
        onChosen: slot => owner.actions.tell(SubjectStore.assignSubjectToSlot(owner.subject, slot))
    }

    PanelMenuItem {
        action: owner.actions.unassign
        offered: owner.actions.objects
    }

    PanelMenuItem {
        action: owner.actions.detach
        offered: owner.actions.objects
    }

    PanelMenuItem {
        action: owner.actions.autoAssignOn
        offered: owner.actions.objects && owner.actions.has(SubjectStoreFeatures.ObjectAutoAssign)
    }

    PanelMenuItem {
        action: owner.actions.autoAssignOff
        offered: owner.actions.objects && owner.actions.has(SubjectStoreFeatures.ObjectAutoAssign)
    }

    PanelMenuSeparator {
        offered: owner.actions.smart
    }

    PanelMenuItem {
        action: owner.actions.merge
        offered: owner.actions.smart
    }

    PanelMenuItem {
        action: owner.actions.split
        offered: owner.actions.smart
    }

    PanelMenuItem {
        action: owner.actions.swap
        offered: owner.actions.smart
    }

    PanelMenuItem {
        action: owner.actions.reboot
        offered: owner.actions.smart
    }

    PanelMenuSeparator {
        offered: owner.actions.characters
    }

    PanelMenuItem {
        action: owner.actions.calibrate
        offered: owner.actions.characters
    }

    PanelMenuItem {
        action: owner.actions.decalibrate
        offered: owner.actions.characters
    }

    PanelMenuSeparator {}

    PanelMenuItem {
        action: owner.actions.exportSubject
    }

    PanelMenuItem {
        action: owner.actions.exportTemplate
    }

    PanelMenuItem {
        action: owner.actions.remove
    }
}
