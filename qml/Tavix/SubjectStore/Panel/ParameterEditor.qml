import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore 1.0
import Tavix.SubjectStore.Controls 1.0

/// The editor that suits a parameter. `parameter` is a row of a parameter model.
Loader {
    id: editor

    required property var parameter
    property var panel: null
    /// The subject whose parameter it is; null for a setting.
    property var subject: null

    readonly property string key: parameter.key
    readonly property string label: parameter.label
    readonly property bool editable: parameter.editable === true
    readonly property bool takesPresets: SubjectStore.objectPresetModel !== null && subject !== null && (SubjectStore.subjectFlags(subject) & (SubjectFlags.Rigid | SubjectFlags.Smart)) !== 0

    signal finished(var result)

    sourceComponent: {
        switch (editor.parameter.type) {
        case "bool":
            return toggle
        case "number":
            return key === "CancelledCalibrationGracePeriod" ? period : number
        case "option":
            return key === "CreateSubjectSkin" ? skin : choice
        case "colour":
            return colour
        case "action":
            return state
        }
        // Not edited itself: choosing a preset applies it.
        if (key === "Parameters/PresetName" && takesPresets)
            return preset
        if (!editable)
            return fixed
        return key === "Parameters/Name" || /^Create.*Name$/.test(key) ? name : text
    }

    // qmllint disable unqualified
    Component {
        id: name

        SubjectStoreNameParameter {
            parameter: editor.parameter
            panel: editor.panel
            subject: editor.subject
        }
    }
    Component {
        id: skin

        SubjectStoreSkinParameter {
            parameter: editor.parameter
            onFinished: result => editor.finished(result)
        }
    }
    Component {
        id: preset

        SubjectStoreObjectPresetParameter {
            parameter: editor.parameter
            panel: editor.panel
            onFinished: result => editor.finished(result)
        }
    }
    Component {
        id: period

        SubjectStoreKeepCancelledPeriod {
            parameter: editor.parameter
        }
    }
    Component {
        id: text

        PanelTextField {
            committed: editor.parameter.value || ""
            problem: typing ? "" : editor.parameter.problem || ""
            Accessible.name: editor.label
            onEdited: text => editor.parameter.value = text
        }
    }
    Component {
        id: fixed

        ElidedLabel {
            text: editor.parameter.value || "–"
            elide: Text.ElideMiddle
            verticalAlignment: Text.AlignVCenter
            topPadding: Math.round((Theme.rowHeight + Theme.unit - Theme.metrics.height) / 2)
            bottomPadding: topPadding
            Accessible.name: qsTr("%1: %2").arg(editor.label).arg(text)
        }
    }
    Component {
        id: number

        NumberField {
            number: Number(editor.parameter.value)
            decimals: Math.abs(number) > 1e6 ? 0 : 3
            minimum: -1e9
            maximum: 1e9
            enabled: editor.editable
            Accessible.name: editor.label
            onEdited: number => editor.parameter.value = number
        }
    }
    Component {
        id: toggle

        WrappingCheckBox {
            text: editor.label
            on: editor.parameter.value === true
            enabled: editor.editable
            onEdited: on => editor.parameter.value = on
        }
    }
    Component {
        id: choice

        ChoiceField {
            model: editor.parameter.choices
            chosen: editor.parameter.value || ""
            enabled: editor.editable && count > 0
            Accessible.name: editor.label
            onEdited: name => editor.parameter.value = name
        }
    }
    Component {
        id: colour

        ColourField {
            label: editor.label
            colour: editor.parameter.value || ""
            editable: editor.editable
            onEdited: colour => editor.parameter.value = colour
        }
    }
    // Whether something can be done is derived from the other settings: it is told, not edited.
    Component {
        id: state

        Label {
            text: editor.parameter.problem || qsTr("Possible")
            color: editor.parameter.problem ? Theme.secondaryText : Theme.good
            wrapMode: Text.Wrap
            topPadding: Math.round((Theme.rowHeight + Theme.unit - Theme.metrics.height) / 2)
            bottomPadding: topPadding
            Accessible.name: qsTr("%1: %2").arg(editor.label).arg(text)
        }
    }
    // qmllint enable unqualified
}
