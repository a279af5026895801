import QtQuick
import QtQuick.Controls

/// A number with as many decimals as it needs and buttons to step it.
SpinBox {
    id: field

    property real number: 0
    property real minimum: -1e6
    property real maximum: 1e6
    property real step: 1
    property int decimals: 3
    property string unit
    readonly property real factor: Math.pow(10, decimals)

    signal edited(real number)

    function bound(number: real): int {
        return Math.round(Math.max(-2e9, Math.min(2e9, number * field.factor)))
    }

    editable: true
    leftPadding: Theme.margin
    implicitHeight: Theme.rowHeight + Theme.unit
    from: bound(minimum)
    to: bound(maximum)
    stepSize: Math.max(1, Math.round(step * factor))
    value: bound(number)

    background: Rectangle {
        implicitWidth: 30 * Theme.unit
        color: field.enabled ? Theme.surface : Theme.raised
        radius: Theme.radius
        border.width: field.activeFocus ? 2 : 1
        border.color: field.activeFocus ? Theme.highlight : Theme.line
    }
    up.indicator: Item {
        x: field.width - width - 1
        width: Theme.rowHeight
        height: Math.floor(field.height / 2)

        Icon {
            anchors.centerIn: parent
            width: Math.round(Theme.iconSize * 0.75)
            height: width
            name: "arrow"
            rotation: -90
            colour: !field.enabled || field.value >= field.to ? Theme.disabledText : field.up.hovered ? Theme.text : Theme.secondaryText
        }
    }
    down.indicator: Item {
        x: field.width - width - 1
        y: field.height - height
        width: Theme.rowHeight
        height: Math.floor(field.height / 2)

        Icon {
            anchors.centerIn: parent
            width: Math.round(Theme.iconSize * 0.75)
            height: width
            name: "arrow"
            rotation: 90
            colour: !field.enabled || field.value <= field.from ? Theme.disabledText : field.down.hovered ? Theme.text : Theme.secondaryText
        }
    }
    contentItem: TextInput {
        text: field.displayText
        font: field.font
        color: field.enabled ? Theme.text : Theme.disabledText
        selectionColor: Theme.highlight
        selectedTextColor: Theme.highlightedText
        verticalAlignment: TextInput.AlignVCenter
        readOnly: !field.editable
        selectByMouse: true
        clip: true
        rightPadding: Theme.rowHeight
        validator: field.validator
        inputMethodHints: field.inputMethodHints
    }
    validator: DoubleValidator {
        bottom: field.minimum
        top: field.maximum
        decimals: field.decimals
        notation: DoubleValidator.StandardNotation
        locale: Qt.locale().name
    }
    textFromValue: (value, locale) => {
        const number = value / field.factor
        const text = number.toLocaleString(locale, "f", field.decimals)
        return field.decimals > 0 ? text.replace(new RegExp("\\" + locale.decimalPoint + "?0+$"), "") : text
    }
    valueFromText: (text, locale) => {
        try {
            return field.bound(Number.fromLocaleString(locale, text))
        } catch (error) {
            return field.value
        }
    }
    onValueModified: {
        field.edited(field.value / field.factor)
        // What is shown follows the store again, also when it has refused the number.
        field.value = Qt.binding(() => field.bound(field.number))
    }
}
