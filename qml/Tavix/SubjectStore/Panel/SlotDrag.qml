import QtQuick
import Tavix.SubjectStore

/// An object on its way into a slot: which one, and where it may go.
QtObject {
    id: drag

    required property var panel
    property bool active
    property var subject
    property string subjectKey
    property string name
    property string colour
    /// Where the pointer is, in the list.
    property point position
    /// The slot under the pointer that takes it; undefined for none.
    property var target

    readonly property bool possible: active && panel.slotsFor(subject).length > 0

    signal finished(var subject, var slot)

    function begin(item: var, label: string, swatch: string) {
        if (!item)
            return
        subject = item.subject
        subjectKey = item.subject.toString()
        name = label
        colour = swatch
        target = undefined
        active = true
    }

    function accepts(slot: var): bool {
        return active && slot !== undefined && SubjectStore.canAssignSubjectToSlot(subject, slot)
    }

    function end() {
        if (!active)
            return
        active = false
        if (target)
            finished(subject, target)
        target = undefined
    }

    function cancel() {
        target = undefined
        active = false
    }
}
