import QtQuick
import Tavix.SubjectStore 1.0
import Tavix.SubjectStore.Panel 1.0

/// The preset that the selected objects have their parameters from. To choose one applies it to all of them.
ChoiceField {
    id: control

    required property var parameter
    required property var panel

    signal finished(var result)

    model: SubjectStore.objectPresetModel
    textRole: "name"
    valueRole: "storeId"
    chosen: parameter.value || ""
    enabled: panel !== null && count > 0
    Accessible.name: parameter.label
    onEdited: name => finished(panel.applyPreset(control.valueAt(control.find(name)), panel.selectedSubjects))
}
