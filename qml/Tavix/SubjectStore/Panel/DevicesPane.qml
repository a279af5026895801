import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import QtQml.Models
import Tavix.SubjectStore 1.0

/// The devices that the host knows, and what can be done with those that are selected.
ColumnLayout {
    id: pane

    required property var panel

    readonly property var selection: panel ? panel.selection : []
    readonly property var selectedDevices: selection.filter(item => item.device !== "")
    property int anchor: -1

    signal finished(var result)

    function deviceAt(index: int): var {
        return devices.items.get(index).model
    }
    function isSelected(urn: string): bool {
        return pane.selectedDevices.some(item => item.device === urn)
    }
    /// As lists do: a click selects one, with Shift all from the last one on, with Ctrl it adds or takes away.
    function choose(index: int, modifiers: int) {
        if (index < 0 || index >= list.count)
            return
        list.currentIndex = index
        const item = pane.deviceAt(index).selectionItem
        if (modifiers & Qt.ShiftModifier) {
            pane.selectRange(pane.anchor < 0 ? index : Math.min(pane.anchor, list.count - 1), index)
            return
        }
        pane.anchor = index
        if (modifiers & Qt.ControlModifier)
            pane.toggle(item)
        else
            pane.panel.select([item])
    }
    function toggle(item: var) {
        const others = pane.selectedDevices.filter(other => !other.equals(item))
        pane.panel.select(others.length < pane.selectedDevices.length ? others : others.concat([item]))
    }
    function selectRange(first: int, last: int) {
        const items = []
        for (let index = Math.min(first, last); index <= Math.max(first, last); ++index)
            items.push(pane.deviceAt(index).selectionItem)
        pane.panel.select(items)
    }
    /// The smart objects that the selected devices are linked to.
    function linkedSubjects(): var {
        const names = []
        for (let index = 0; index < list.count; ++index) {
            const device = pane.deviceAt(index)
            if (device.linkedTo !== "" && pane.isSelected(device.urn))
                names.push(device.linkedTo)
        }
        return names.length > 0 ? SubjectStore.subjects().filter(subject => names.includes(SubjectStore.subjectName(subject))) : []
    }

    spacing: 0

    ListView {
        id: list

        Layout.fillWidth: true
        Layout.fillHeight: true
        clip: true
        activeFocusOnTab: true
        keyNavigationEnabled: false
        reuseItems: true
        boundsBehavior: Flickable.StopAtBounds
        ScrollBar.vertical: ScrollBar {}
        Accessible.role: Accessible.List
        Accessible.name: qsTr("Devices")
        onActiveFocusChanged: {
            if (activeFocus && currentIndex < 0 && count > 0)
                currentIndex = 0
        }
        Keys.onPressed: event => {
            event.accepted = true
            switch (event.key) {
            case Qt.Key_Up:
                return pane.choose(Math.max(0, list.currentIndex - 1), event.modifiers & Qt.ShiftModifier)
            case Qt.Key_Down:
                return pane.choose(Math.min(list.count - 1, list.currentIndex + 1), event.modifiers & Qt.ShiftModifier)
            case Qt.Key_Home:
                return pane.choose(0, event.modifiers & Qt.ShiftModifier)
            case Qt.Key_End:
                return pane.choose(list.count - 1, event.modifiers & Qt.ShiftModifier)
            case Qt.Key_Space:
                return pane.choose(list.currentIndex, Qt.ControlModifier)
            case Qt.Key_A:
                if (event.modifiers & Qt.ControlModifier && list.count > 0)
                    return pane.selectRange(0, list.count - 1)
            }
            event.accepted = false
        }

        model: DelegateModel {
            id: devices

            model: pane.panel ? pane.panel.devices : null
            // qmllint disable unqualified
            delegate: DeviceRow {
                id: row

                width: ListView.view.width
                selected: pane.isSelected(urn)
                marked: ListView.isCurrentItem && ListView.view.activeFocus

                TapHandler {
                    acceptedModifiers: Qt.KeyboardModifierMask
                    onTapped: {
                        list.forceActiveFocus(Qt.MouseFocusReason)
                        pane.choose(row.index, point.modifiers)
                    }
                }
            }
            // qmllint enable unqualified
        }

        EmptyPane {
            visible: list.count === 0
            title: qsTr("No devices")
            text: qsTr("Devices that the host finds show here.")
        }
    }
    Rectangle {
        Layout.fillWidth: true
        implicitHeight: commands.implicitHeight + 2 * Theme.margin
        visible: list.count > 0
        color: Theme.header

        Rectangle {
            width: parent.width
            height: 1
            color: Theme.line
        }
        Flow {
            id: commands

            anchors.left: parent.left
            anchors.right: parent.right
            anchors.verticalCenter: parent.verticalCenter
            anchors.margins: Theme.margin
            spacing: Theme.spacing

            CommandButton {
                id: create

                readonly property bool possible: pane.panel !== null && (pane.panel.revision, SubjectStore.canCreateSmartObjects(pane.selection))

                reason: possible ? "" : pane.selectedDevices.length === 0 ? qsTr("Select devices that are not linked.") : qsTr("Not possible with these devices.")
                toolTip: qsTr("Makes a smart object for each of the selected devices.")
                primary: true
                action: Action {
                    text: qsTr("Create smart objects")
                    enabled: create.possible
                    onTriggered: pane.finished(SubjectStore.createSmartObjects(pane.selection))
                }
            }
            CommandButton {
                id: reboot

                readonly property var subjects: pane.panel ? (pane.panel.revision, pane.selection, pane.linkedSubjects()) : []

                reason: subjects.length > 0 ? "" : qsTr("Select devices that are linked to smart objects.")
                toolTip: qsTr("Reboots all devices of the smart objects that the selected devices are linked to.")
                action: Action {
                    text: qsTr("Reboot linked objects")
                    enabled: reboot.reason === ""
                    onTriggered: pane.finished(SubjectStore.rebootSubjects(reboot.subjects))
                }
            }
        }
    }
}
