import QtQuick
import QtQuick.Controls
import QtQuick.Dialogs
import QtQuick.Layouts
import QtQuick.Window
import Tavix.SubjectStore 1.0
import Tavix.SubjectStore.Panel 1.0

/// The skin that a subject is made with; more can be added from files.
RowLayout {
    id: control

    required property var parameter

    signal finished(var result)

    spacing: Theme.spacing

    ChoiceField {
        Layout.fillWidth: true
        Layout.minimumWidth: 0
        model: control.parameter.choices
        chosen: control.parameter.value || ""
        enabled: control.parameter.editable !== false && count > 0
        Accessible.name: control.parameter.label
        onEdited: name => control.parameter.value = name
    }
    CommandButton {
        toolTip: qsTr("Copies a skin into your folder, where it can be chosen from.")
        action: Action {
            text: qsTr("Add file…")
            onTriggered: dialog.open()
        }
    }
    FileDialog {
        id: dialog

        parentWindow: control.Window.window
        title: qsTr("Add a skin")
        nameFilters: [qsTr("Skins (*.skin)"), qsTr("All files (*)")]
        onAccepted: control.finished(SubjectStore.copyFileToUserFolder(selectedFile, SubjectStoreQml.ESubjectSkin))
    }
}
