import QtQuick
import QtQuick.Controls

/// An editor with its label, and what is wrong with what it holds. The label stands above the editor where there is
/// little room.
Item {
    id: field

    property string label
    property string problem
    default property Item editor
    readonly property bool narrow: width < 75 * Theme.unit
    readonly property real editorX: narrow ? 0 : Math.round(width * 0.36) + Theme.margin
    readonly property real editorY: narrow && label !== "" ? title.height + Theme.spacing / 2 : 0
    readonly property real editorHeight: editor ? editor.implicitHeight : 0

    implicitWidth: 30 * Theme.unit
    implicitHeight: Math.max(editorY + editorHeight, title.y + (label !== "" ? title.height : 0)) + (failure.active ? failure.implicitHeight + Theme.spacing / 2 : 0)
    onEditorChanged: {
        if (editor)
            editor.parent = field
    }

    Label {
        id: title

        // In line with the text of a single line editor beside it.
        y: field.narrow ? 0 : Math.round((Theme.rowHeight + Theme.unit - Theme.metrics.height) / 2)
        width: field.narrow ? field.width : field.editorX - Theme.margin
        text: field.label
        textFormat: Text.PlainText
        color: Theme.secondaryText
        wrapMode: Text.Wrap
        Accessible.ignored: true
    }
    Binding {
        target: field.editor
        property: "x"
        value: field.editorX
    }
    Binding {
        target: field.editor
        property: "y"
        value: field.editorY
    }
    Binding {
        target: field.editor
        property: "width"
        value: field.width - field.editorX
    }
    Loader {
        id: failure

        x: field.editorX
        y: field.editorY + field.editorHeight + Theme.spacing / 2
        width: field.width - field.editorX
        active: field.problem !== ""
        visible: active
        sourceComponent: FailureLabel {
            // qmllint disable unqualified
            text: field.problem
            // qmllint enable unqualified
        }
    }
}
