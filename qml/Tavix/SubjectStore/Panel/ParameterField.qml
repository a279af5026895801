import QtQuick

/// A parameter with its label, its editor, and what is wrong with it.
LabelledField {
    id: field

    required property var parameter
    property var panel: null
    property var subject: null

    signal finished(var result)

    label: parameter.type === "bool" ? "" : parameter.label
    problem: parameter.type === "action" || (editor.item && editor.item.tellsProblem === true) ? "" : parameter.problem || ""

    ParameterEditor {
        parameter: field.parameter
        panel: field.panel
        subject: field.subject
        onFinished: result => field.finished(result)
    }
}
