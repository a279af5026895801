import QtQuick
import Tavix.SubjectStore 1.0
import Tavix.SubjectStore.Panel 1.0

/// The name of a subject, or of one to be made: says while somebody is typing why a name would be refused.
Column {
    id: control

    required property var parameter
    property var panel: null
    /// The subject that has the name; null for one to be made.
    property var subject: null
    readonly property bool tellsProblem: true
    readonly property string problem: {
        if (field.typing)
            return control.problemOf(field.text)
        return control.parameter.problem || ""
    }

    function problemOf(name: string): string {
        // To be made, a subject may go without a name for now.
        if (name === (control.parameter.value || "") || (!control.subject && name === ""))
            return ""
        if (control.panel)
            return control.panel.nameProblem(name, control.subject || control.panel.noSubject)
        return SubjectStore.isSubjectNameInUse(name) ? qsTr("There is a subject with this name.") : ""
    }

    spacing: Theme.spacing / 2

    PanelTextField {
        id: field

        width: parent.width
        committed: control.parameter.value || ""
        problem: control.problem
        // The name of a subject that exists is that of one to be calibrated again.
        commitsRefused: !control.subject
        enabled: control.parameter.editable !== false
        placeholderText: control.subject ? "" : qsTr("No name")
        Accessible.name: control.parameter.label
        onEdited: text => control.parameter.value = text
    }
    Loader {
        width: parent.width
        active: control.problem !== ""
        visible: active
        sourceComponent: FailureLabel {
            // qmllint disable unqualified
            text: control.problem
            // qmllint enable unqualified
        }
    }
}
