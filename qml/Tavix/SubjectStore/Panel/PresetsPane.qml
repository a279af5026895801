import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore 1.0

/// Named presets: made of the first selected object, applied to all selected ones.
ColumnLayout {
    id: pane

    required property var panel

    readonly property var presets: SubjectStore.objectPresetModel
    readonly property var subjects: panel ? panel.selectedSubjects : []
    readonly property var current: list.currentItem

    signal finished(var result)

    /// The model answers only whether it did what it was asked.
    function done(succeeded: bool, reason: string): var {
        return { "failed": !succeeded, "name": "Failed", "reason": reason }
    }
    function add() {
        const added = pane.presets.addPreset(name.text)
        pane.finished(pane.done(added, qsTr("The preset %1 could not be added.").arg(name.text)))
        if (added)
            name.clear()
    }
    function apply() {
        pane.finished(pane.panel.applyPreset(pane.current.storeId, pane.subjects))
    }
    function remove() {
        const text = qsTr("The preset %1 could not be removed.").arg(pane.current.name)
        pane.finished(pane.done(pane.presets.removePreset(pane.current.storeId), text))
    }

    spacing: 0

    Item {
        Layout.fillWidth: true
        Layout.fillHeight: true
        visible: !pane.presets

        EmptyPane {
            title: qsTr("No presets")
            text: qsTr("Object presets are switched off.")
        }
    }
    RowLayout {
        Layout.fillWidth: true
        Layout.margins: Theme.margin
        visible: !!pane.presets
        spacing: Theme.spacing

        PanelTextField {
            id: name

            Layout.fillWidth: true
            Layout.minimumWidth: 0
            placeholderText: qsTr("Name of a new preset")
            problem: text === "" || !pane.presets || (list.count, pane.presets.presetNameIsValid(text)) ? "" : qsTr("There is a preset with this name.")
            Accessible.name: placeholderText
            // Nothing is kept until it is added.
            onTextEdited: typing = true
            onActiveFocusChanged: typing = true
            Keys.onReturnPressed: {
                if (adding.enabled)
                    adding.trigger()
            }
            Keys.onEscapePressed: clear()
        }
        CommandButton {
            reason: name.text === "" ? qsTr("Enter a name first.") : name.problem
            toolTip: pane.subjects.length > 0 ? qsTr("Keeps the parameters of the first selected object.") : qsTr("Nothing is selected: the preset will have no parameters.")
            action: Action {
                id: adding

                text: qsTr("Add")
                enabled: name.text !== "" && !name.refused
                onTriggered: pane.add()
            }
        }
    }
    FailureLabel {
        Layout.fillWidth: true
        Layout.margins: Theme.margin
        Layout.topMargin: 0
        text: name.problem
    }
    Rectangle {
        Layout.fillWidth: true
        visible: !!pane.presets
        implicitHeight: 1
        color: Theme.line
    }
    ListView {
        id: list

        Layout.fillWidth: true
        Layout.fillHeight: true
        clip: true
        visible: !!pane.presets
        activeFocusOnTab: true
        keyNavigationEnabled: true
        currentIndex: -1
        boundsBehavior: Flickable.StopAtBounds
        model: pane.presets
        ScrollBar.vertical: ScrollBar {}
        Accessible.role: Accessible.List
        Accessible.name: qsTr("Presets")
        onActiveFocusChanged: {
            if (activeFocus && currentIndex < 0 && count > 0)
                currentIndex = 0
        }
        Keys.onReturnPressed: {
            if (applying.enabled)
                applying.trigger()
        }
        Keys.onDeletePressed: {
            if (removing.enabled)
                removing.trigger()
        }

        delegate: PresetRow {
            width: ListView.view.width
            onClicked: {
                ListView.view.currentIndex = index
                ListView.view.forceActiveFocus(Qt.MouseFocusReason)
            }
        }

        EmptyPane {
            visible: list.count === 0
            title: qsTr("No presets yet")
            text: qsTr("Select an object and enter a name above to keep its colour and groups as a preset.")
        }
    }
    Rectangle {
        Layout.fillWidth: true
        implicitHeight: commands.implicitHeight + 2 * Theme.margin
        visible: list.visible && list.count > 0
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
                reason: !pane.current ? qsTr("Choose a preset first.") : pane.subjects.length === 0 ? qsTr("Select the objects first.") : ""
                toolTip: qsTr("Gives the selected objects the parameters of the preset (Enter).")
                primary: true
                action: Action {
                    id: applying

                    text: pane.subjects.length > 1 ? qsTr("Apply to %1 objects").arg(pane.subjects.length) : qsTr("Apply")
                    enabled: pane.current !== null && pane.subjects.length > 0
                    onTriggered: pane.apply()
                }
            }
            CommandButton {
                reason: !pane.current ? qsTr("Choose a preset first.") : pane.current.readOnly ? qsTr("This preset is read-only.") : ""
                toolTip: qsTr("Removes the preset; objects keep what they have from it (Del).")
                action: Action {
                    id: removing

                    text: qsTr("Remove")
                    enabled: pane.current !== null && !pane.current.readOnly
                    onTriggered: pane.remove()
                }
            }
        }
    }
}
