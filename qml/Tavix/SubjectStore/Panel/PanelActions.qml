import QtQuick
import Tavix.SubjectStore

/// Every command of the list, in one place: menus, tool bar and keys give the same ones.
QtObject {
    id: actions

    required property var panel
    required property PanelDialogs dialogs

    readonly property var rows: panel ? panel.rows : null
    /// The menus that are open. What takes asking the store about the whole selection is only asked while there is one:
    /// the store changes ten times a second, and thousands of subjects can be selected.
    property int openMenus: 0
    readonly property bool asked: openMenus > 0
    readonly property int revision: asked && panel ? panel.revision : 0
    /// What was selected when a row's menu opened, while that is open: a command of it is for what the operator has seen
    /// there. What a client has removed meanwhile makes it fail, and does not let it pass by in silence.
    property var held: null
    readonly property var selection: held ? held.selection : panel ? panel.selection : []
    readonly property var ids: held ? held.ids : panel ? panel.selectedSubjects : []
    readonly property bool any: ids.length > 0
    readonly property var flags: ids.map(id => SubjectStore.subjectFlags(id))
    /// A command passes by what it is not for.
    readonly property var objectIds: ofKind(SubjectFlags.Rigid | SubjectFlags.Smart)
    readonly property var characterIds: ofKind(SubjectFlags.SolvedFromClusters)
    readonly property bool objects: objectIds.length > 0
    readonly property bool smart: flags.some(one => one & SubjectFlags.Smart)
    readonly property bool characters: characterIds.length > 0
    readonly property int features: SubjectStore.enabledFeatures()
    readonly property string needsSubject: qsTr("Select a subject first.")
    readonly property string needsOne: qsTr("Select one subject first.")
    readonly property string needsSmart: qsTr("Select a smart object first.")
    readonly property string needsCharacter: qsTr("Select a character first.")

    /// A failure in words; empty when a command has succeeded.
    signal told(string sentence)
    signal renameWanted
    signal searchWanted
    signal revealWanted(var subject)

    function has(feature: int): bool {
        return (features & feature) !== 0
    }

    function hold() {
        held = {
            "selection": panel.selection.slice(),
            "ids": panel.selectedSubjects.slice()
        }
    }

    function release() {
        held = null
    }

    /// The selected subjects that have one of these flags.
    function ofKind(mask: int): var {
        return ids.filter((_, i) => flags[i] & mask)
    }

    /// Shows how a command ended; whether it succeeded.
    function tell(result: var): bool {
        told(result.failed ? result.reason || result.name : "")
        return !result.failed
    }

    function everySubject(): var {
        return SubjectStore.subjects()
    }

    /// "Ada", or "Ada, Grace and 3 more".
    function names(subjects: var): string {
        const shown = subjects.slice(0, 3).map(id => SubjectStore.subjectName(id))
        const more = subjects.length - shown.length
        return more > 0 ? qsTr("%1 and %2 more").arg(shown.join(", ")).arg(more) : shown.join(", ")
    }

    function askRemove() {
        const doomed = ids
        const onlyObjects = doomed.every(id => SubjectStore.subjectFlags(id) & (SubjectFlags.Rigid | SubjectFlags.Smart))
        dialogs.confirm.ask(doomed.length === 1 ? qsTr("Remove subject?") : qsTr("Remove %1 subjects?").arg(doomed.length), names(doomed), qsTr("Remove"), onlyObjects ? "" : qsTr("Remove what is assigned to them as well"), children => SubjectStore.removeSubjects(doomed, children))
    }

    readonly property PanelAction search: PanelAction {
        text: qsTr("Search")
        shortcut: "Ctrl+F"
        keys: "Ctrl+F"
        onTriggered: actions.searchWanted()
    }
    readonly property PanelAction onlyWarnings: PanelAction {
        text: qsTr("Only subjects with warnings")
        checkable: true
        checked: actions.rows ? actions.rows.onlyWarnings : false
        onTriggered: actions.rows.onlyWarnings = checked
    }
    readonly property PanelAction expandAll: PanelAction {
        text: qsTr("Expand all")
        keys: "Ctrl+Right"
        onTriggered: actions.rows.expandAll()
    }
    readonly property PanelAction collapseAll: PanelAction {
        text: qsTr("Collapse all")
        keys: "Ctrl+Left"
        onTriggered: actions.rows.collapseAll()
    }

    readonly property PanelAction enable: PanelAction {
        text: qsTr("Enable")
        enabled: actions.any
        needs: actions.needsSubject
        onTriggered: actions.tell(SubjectStore.setSubjectsEnabled(actions.ids, true))
    }
    readonly property PanelAction disable: PanelAction {
        text: qsTr("Disable")
        enabled: actions.any
        needs: actions.needsSubject
        onTriggered: actions.tell(SubjectStore.setSubjectsEnabled(actions.ids, false))
    }
    readonly property PanelAction toggle: PanelAction {
        text: qsTr("Enable or disable")
        keys: "Space"
        enabled: actions.any
        needs: actions.needsSubject
        onTriggered: actions.tell(SubjectStore.toggleSubjectsEnabled(actions.ids))
    }
    readonly property PanelAction enableAll: PanelAction {
        text: qsTr("Enable all subjects")
        onTriggered: actions.tell(SubjectStore.setSubjectsEnabled(actions.everySubject(), true))
    }
    readonly property PanelAction disableAll: PanelAction {
        text: qsTr("Disable all subjects")
        onTriggered: actions.tell(SubjectStore.setSubjectsEnabled(actions.everySubject(), false))
    }

    readonly property PanelAction rename: PanelAction {
        text: qsTr("Rename")
        keys: "F2"
        enabled: actions.ids.length === 1
        needs: actions.needsOne
        onTriggered: actions.renameWanted()
    }
    readonly property PanelAction remove: PanelAction {
        text: qsTr("Remove…")
        keys: "Del"
        enabled: actions.any
        needs: actions.needsSubject
        onTriggered: actions.askRemove()
    }
    readonly property PanelAction recolour: PanelAction {
        text: qsTr("Colour…")
        enabled: actions.any
        needs: actions.needsSubject
        onTriggered: actions.dialogs.recolour(actions.ids)
    }

    readonly property PanelAction merge: PanelAction {
        text: qsTr("Merge")
        tip: qsTr("Move the clusters to the smart object that was selected first, and remove the others.")
        enabled: (actions.revision, actions.asked && SubjectStore.canMergeSelectedSmartObjects(actions.selection))
        needs: qsTr("Select two or more smart objects.")
        onTriggered: actions.tell(SubjectStore.mergeSelectedSmartObjects(actions.selection))
    }
    readonly property PanelAction split: PanelAction {
        text: qsTr("Split")
        tip: qsTr("Make an object of each cluster.")
        enabled: (actions.revision, actions.asked && SubjectStore.canSplitSelectedSmartObjects(actions.selection))
        needs: qsTr("Select smart objects that have two or more clusters.")
        onTriggered: actions.tell(SubjectStore.splitSelectedSmartObjects(actions.selection))
    }
    readonly property PanelAction swap: PanelAction {
        text: qsTr("Swap clusters…")
        enabled: (actions.revision, actions.asked && actions.ids.length > 0 && actions.ids.length < 3 && SubjectStore.canSwapSmartClusters(actions.ids[0], actions.ids[actions.ids.length - 1]))
        needs: qsTr("Select two smart objects, or one with two or more clusters.")
        onTriggered: actions.dialogs.swap.ask(actions.ids[0], actions.ids[actions.ids.length - 1])
    }
    readonly property PanelAction assignPatterns: PanelAction {
        text: qsTr("Assign optimal patterns")
        tip: qsTr("Give the clusters of all smart objects patterns that are told apart best.")
        onTriggered: actions.tell(SubjectStore.assignOptimalActiveMarkerPatterns(actions.selection))
    }
    readonly property PanelAction autoPatterns: PanelAction {
        text: qsTr("Assign patterns automatically")
        checkable: true
        checked: actions.panel ? actions.panel.autoPatternManagement : false
        onTriggered: {
            actions.tell(actions.panel.setAutoPatternManagement(!actions.panel.autoPatternManagement))
            checked = Qt.binding(() => actions.panel.autoPatternManagement)
        }
    }
    readonly property PanelAction reboot: PanelAction {
        text: qsTr("Reboot devices")
        enabled: actions.smart
        needs: actions.needsSmart
        onTriggered: actions.tell(SubjectStore.rebootSubjects(actions.ids))
    }

    readonly property PanelAction calibrate: PanelAction {
        text: qsTr("Calibrate")
        enabled: actions.characters
        needs: actions.needsCharacter
        onTriggered: actions.tell(SubjectStore.calibrateCFC(actions.characterIds))
    }
    readonly property PanelAction decalibrate: PanelAction {
        text: qsTr("Remove calibration")
        enabled: actions.characters
        needs: actions.needsCharacter
        onTriggered: actions.tell(SubjectStore.decalibrateCFC(actions.characterIds))
    }

    readonly property PanelAction unassign: PanelAction {
        text: qsTr("Take out of slot")
        enabled: (actions.revision, actions.asked && actions.any && SubjectStore.canUnassignSubjects(actions.ids))
        needs: qsTr("Select objects that are in slots.")
        onTriggered: actions.tell(SubjectStore.unassignSubjects(actions.ids))
    }
    readonly property PanelAction detach: PanelAction {
        text: qsTr("Detach")
        tip: qsTr("Take out of the slot, and do not assign automatically again.")
        enabled: (actions.revision, actions.asked && actions.any && SubjectStore.canDetachClusters(actions.ids))
        needs: qsTr("Select objects that are in slots.")
        onTriggered: actions.tell(SubjectStore.detachClusters(actions.ids))
    }
    readonly property PanelAction autoAssignOn: PanelAction {
        text: qsTr("Assign automatically")
        enabled: actions.objects
        needs: qsTr("Select an object first.")
        onTriggered: actions.tell(actions.panel.setAutoAssign(actions.objectIds, true))
    }
    readonly property PanelAction autoAssignOff: PanelAction {
        text: qsTr("Do not assign automatically")
        enabled: actions.objects
        needs: qsTr("Select an object first.")
        onTriggered: actions.tell(actions.panel.setAutoAssign(actions.objectIds, false))
    }

    readonly property PanelAction exportSubject: PanelAction {
        text: qsTr("Export subject…")
        enabled: actions.ids.length === 1
        needs: actions.needsOne
        onTriggered: actions.dialogs.exportTo(actions.ids[0], false)
    }
    readonly property PanelAction exportTemplate: PanelAction {
        text: qsTr("Export template…")
        enabled: actions.ids.length === 1
        needs: actions.needsOne
        onTriggered: actions.dialogs.exportTo(actions.ids[0], true)
    }

    readonly property PanelAction addBasic: PanelAction {
        text: qsTr("Basic object…")
        onTriggered: actions.dialogs.add.ask("basic")
    }
    readonly property PanelAction addSmart: PanelAction {
        text: qsTr("Smart object from template…")
        onTriggered: actions.dialogs.add.ask("smart")
    }
    readonly property PanelAction addCharacter: PanelAction {
        text: qsTr("Character from template…")
        onTriggered: actions.dialogs.add.ask("character")
    }
    readonly property PanelAction addFromDevices: PanelAction {
        text: qsTr("Smart objects from selected devices")
        enabled: (actions.revision, actions.asked && SubjectStore.canCreateSmartObjects(actions.selection))
        needs: qsTr("Select devices that are not linked to a smart object.")
        onTriggered: actions.tell(SubjectStore.createSmartObjects(actions.selection))
    }
    readonly property PanelAction importSubject: PanelAction {
        text: qsTr("Import subject…")
        onTriggered: actions.dialogs.importFrom(false)
    }
    readonly property PanelAction importMesh: PanelAction {
        text: qsTr("Import mesh…")
        onTriggered: actions.dialogs.importFrom(true)
    }

    /// Those that keys give while the list has the focus.
    readonly property var ofList: [toggle, rename, remove, expandAll, collapseAll]
}
