import QtQuick
import QtQuick.Controls
import QtQuick.Layouts

/// A colour: a swatch that opens a palette, and its text "#rrggbb" to type.
RowLayout {
    id: field

    /// "#aarrggbb"
    property string colour
    property bool editable: true
    property string label

    readonly property string shortText: /^#[0-9a-fA-F]{8}$/.test(colour) ? "#" + colour.slice(3) : colour

    signal edited(string colour)

    function change(text: string) {
        const alpha = field.colour.length === 9 ? field.colour.slice(1, 3) : "ff"
        field.edited(("#" + alpha + text.slice(1)).toLowerCase())
    }

    spacing: Theme.spacing

    AbstractButton {
        id: swatch

        Layout.preferredWidth: Theme.rowHeight + Theme.unit
        Layout.preferredHeight: Theme.rowHeight + Theme.unit
        enabled: field.editable
        text: qsTr("%1: choose from a palette").arg(field.label)
        focusPolicy: Qt.StrongFocus
        Accessible.name: text
        onClicked: swatches.openAt(swatch, 0, swatch.height + 2)
        Keys.onReturnPressed: swatch.clicked()
        Keys.onDownPressed: swatch.clicked()

        background: Rectangle {
            radius: Theme.radius
            color: field.colour || "transparent"
            border.width: swatch.visualFocus ? 2 : 1
            border.color: swatch.visualFocus ? Theme.highlight : Theme.line
        }

        ColourPalette {
            id: swatches

            onPicked: colour => field.edited(colour)
        }

        Tip {
            visible: swatch.hovered && !swatches.opened
            text: qsTr("Choose from a palette")
        }
    }
    PanelTextField {
        id: typed

        Layout.fillWidth: true
        readOnly: !field.editable
        committed: field.shortText
        problem: /^#[0-9a-fA-F]{6}$/.test(text) || text === field.shortText ? "" : qsTr("A colour is written #rrggbb.")
        Accessible.name: field.label
        onEdited: text => field.change(text)

        Tip {
            visible: typed.typing && typed.refused
            delay: 0
            text: typed.problem
        }
    }
}
