import QtQuick

/// The parameters with these keys, in the order of the keys. With `others`, all that do not have these keys.
Column {
    id: form

    required property var model
    property var keys: []
    property bool others: false
    property var panel: null
    property var subject: null
    property bool empty: true

    signal finished(var result)

    /// The order of its children is that in which a column shows them, and in which Tab goes through them.
    function arrange() {
        const shown = []
        for (let index = 0; index < fields.count; ++index) {
            const field = fields.itemAt(index)
            if (field && field.shown)
                shown.push(field)
        }
        form.empty = shown.length === 0
        const sorted = Array.from(shown).sort((one, other) => one.place - other.place)
        if (sorted.every((field, index) => field === shown[index]))
            return
        for (const field of sorted) {
            field.parent = attic
            field.parent = form
        }
    }

    spacing: (width < 75 * Theme.unit ? 2.5 : 1.5) * Theme.spacing

    Item {
        id: attic
    }
    Repeater {
        id: fields

        model: form.model
        onItemAdded: index => {
            if (index === fields.count - 1)
                form.arrange()
            else
                settle.start()
        }
        onItemRemoved: settle.start()

        // qmllint disable unqualified
        Loader {
            id: slot

            required property var model
            required property int index
            readonly property int known: form.keys.indexOf(model.key)
            readonly property bool shown: form.others === (known < 0)
            readonly property int place: form.others ? index : known

            width: form.width
            active: shown
            visible: shown
            sourceComponent: ParameterField {
                parameter: slot.model
                panel: form.panel
                subject: form.subject
                onFinished: result => form.finished(result)
            }
        }
        // qmllint enable unqualified
    }
    Timer {
        id: settle

        interval: 0
        onTriggered: form.arrange()
    }
}
