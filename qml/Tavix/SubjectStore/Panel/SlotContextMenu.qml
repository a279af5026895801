import QtQuick
import Tavix.SubjectStore

/// Puts an object into an empty slot.
ChoiceMenu {
    id: owner

    required property var panel
    required property PanelActions actions
    property var slot

    title: qsTr("Assign")
    nothing: qsTr("No object can be assigned")
    onAboutToShow: choices = panel.candidatesFor(slot).map(candidate => ({
                    "name": qsTr("Assign %1").arg(candidate.name),
                    "value": candidate.id
                }))
    onChosen: object => actions.tell(SubjectStore.assignSubjectToSlot(object, slot))
}
