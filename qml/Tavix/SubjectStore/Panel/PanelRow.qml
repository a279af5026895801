import QtQuick
import Tavix.SubjectStore

/// One row of the list: what the model says of it, and what mouse and keys do to it.
Item {
    id: base

    required property int index
    required property var model

    required property var panel
    required property RowSelection selection
    required property SlotDrag drag
    required property bool current
    required property bool focused
    /// The id in words of the subject that is being renamed.
    required property string renamedSubject
    /// From a text to what is wrong with it as that subject's name.
    required property var nameProblem
    /// The list has put it by for another row.
    property bool pooled

    // A row has few of the roles, and none while the model catches up with a subject that has gone.
    readonly property string rowKind: model.rowKind ?? ""
    readonly property int depth: model.depth ?? 0
    readonly property bool expandable: model.expandable === true
    readonly property bool expanded: model.expanded === true
    readonly property int count: model.count ?? 0
    readonly property int matchCount: model.matchCount ?? count
    readonly property int warningCount: model.warningCount ?? 0
    readonly property string sectionName: model.sectionName ?? ""
    readonly property string sectionKey: model.sectionKey ?? ""
    readonly property var sectionWarnings: model.sectionWarnings ?? []
    readonly property var subjectStoreId: model.subjectStoreId?.copy()
    /// What tells subjects apart; empty without one.
    readonly property string subjectKey: subjectStoreId && subjectStoreId.valid ? subjectStoreId.toString() : ""
    readonly property string subjectName: model.subjectName ?? ""
    readonly property string colour: subjectKey !== "" && panel ? (panel.revision, panel.colour(subjectStoreId)) : ""
    readonly property bool subjectEnabled: model.subjectEnabled === true
    readonly property var subjectWarnings: model.subjectWarnings ?? []
    readonly property int subjectFlags: model.subjectFlags ?? 0
    readonly property int subjectCalibration: model.subjectCalibration ?? SubjectCalibration.Uncalibrated
    readonly property var item: model.subjectSelectionItem?.copy()
    readonly property var parentStoreId: model.parentStoreId?.copy()
    readonly property int element: model.element ?? -1
    readonly property string slotName: model.subjectSlotName ?? ""
    readonly property var patterns: model.subjectPatterns ?? []
    readonly property var devices: model.subjectSmartClusterDeviceNames ?? []
    readonly property var markers: model.subjectSmartAndBasicMarkers ?? []
    readonly property string preset: model.subjectSettingsPreset ?? ""
    readonly property string linkedCamera: model.subjectLinkedCameraURN ?? ""
    readonly property string fileName: (model.subjectFilePath ?? "").replace(/^.*[\/\\]/, "")

    readonly property bool isSection: rowKind === "section"
    readonly property bool isSlot: rowKind === "slot"
    readonly property bool isSubject: rowKind === "subject" || rowKind === "child"
    readonly property bool occupied: isSlot && subjectKey !== ""
    readonly property bool isObject: isSubject && (subjectFlags & (SubjectFlags.Rigid | SubjectFlags.Smart)) !== 0
    readonly property bool calibratable: isSubject && !isObject && model.subjectCalibration !== undefined
    readonly property bool selected: selection.holds(item)
    readonly property bool renaming: !pooled && isSubject && subjectKey !== "" && renamedSubject === subjectKey
    readonly property bool droppable: drag.active && isSlot && !occupied && selection.key(item) !== "" && drag.accepts(item)
    readonly property bool target: droppable && drag.target !== undefined && selection.key(drag.target) === selection.key(item)
    readonly property alias hovered: hover.hovered

    signal pressed(int modifiers)
    signal toggled
    signal enabledToggled
    signal menuWanted(real x, real y)
    signal warningsWanted(Item badge, var warnings)
    signal renamed(string text)
    signal renameShown(Item field)
    signal renameLeft
    signal dragStarted
    signal dragMoved(point scene)

    function warnings(): var {
        return subjectStoreId && subjectStoreId.valid ? panel.warningsOf(subjectStoreId) : []
    }

    height: Theme.rowHeight
    opacity: drag.active && !isSection && !droppable && !(isSubject && subjectKey === drag.subjectKey) ? 0.4 : 1
    Accessible.role: Accessible.TreeItem
    Accessible.name: isSection ? qsTr("%1, %2 subjects").arg(sectionName).arg(count) : isSlot ? qsTr("Slot %1: %2").arg(slotName).arg(occupied ? subjectName : qsTr("empty")) : subjectName
    Accessible.selectable: item !== undefined
    Accessible.selected: selected
    Accessible.onToggleAction: toggled()
    Accessible.onPressAction: pressed(Qt.NoModifier)

    Rectangle {
        anchors.fill: parent
        color: base.target ? Qt.alpha(Theme.good, 0.35) : base.selected ? (base.focused ? Theme.selected : Theme.selectedInactive) : base.hovered && !base.drag.active ? Theme.hovered : "transparent"
    }

    Rectangle {
        visible: base.selected
        width: Math.max(2, Theme.unit / 2)
        height: parent.height
        color: Theme.highlight
    }

    Loader {
        anchors.fill: parent
        sourceComponent: base.isSection ? sectionLine : base.isSlot ? slotLine : base.isSubject ? subjectLine : elementLine
        onLoaded: item.anchors.fill = this
    }

    Rectangle {
        anchors.fill: parent
        visible: (base.current && base.focused) || base.droppable
        color: "transparent"
        border.color: base.droppable ? Theme.good : Theme.highlight
        border.width: 1
    }

    // qmllint disable unqualified
    Component {
        id: sectionLine

        SectionRow {
            row: base
            onWarningsWanted: badge => base.warningsWanted(badge, base.sectionWarnings)
        }
    }

    Component {
        id: subjectLine

        SubjectRow {
            row: base
            onToggleEnabled: base.enabledToggled()
        }
    }

    Component {
        id: slotLine

        SlotRow {
            row: base
        }
    }

    Component {
        id: elementLine

        ElementRow {
            row: base
        }
    }
    // qmllint enable unqualified

    HoverHandler {
        id: hover
    }

    TapHandler {
        id: tap

        enabled: !base.renaming
        onTapped: base.pressed(tap.point.modifiers)
        onDoubleTapped: {
            if (base.expandable)
                base.toggled()
        }
    }

    TapHandler {
        acceptedButtons: Qt.RightButton
        onTapped: eventPoint => base.menuWanted(eventPoint.position.x, eventPoint.position.y)
    }

    DragHandler {
        id: dragging

        target: null
        enabled: base.isObject && !base.renaming
        acceptedDevices: PointerDevice.Mouse | PointerDevice.Stylus
        grabPermissions: PointerHandler.CanTakeOverFromAnything
        dragThreshold: 6
        onActiveChanged: {
            if (!active)
                return base.drag.end()
            base.drag.begin(base.selection.itemAt(base.index), base.subjectName, base.colour)
            base.dragStarted()
        }
        onCentroidChanged: {
            if (active)
                base.dragMoved(centroid.scenePosition)
        }
    }
}
