import QtQuick
import QtQuick.Controls

/// A measurement: its markers, their distance in the model, and the measured one to edit. In two lines where there is
/// little room.
Item {
    id: row

    required property int index
    required property string markers
    required property var measurements
    property bool narrow: false
    property real numberWidth: 20 * Theme.unit

    /// A list shows the first column of a table; the others are read through their places.
    property int changes: 0
    readonly property real modelDistance: (changes, at(1))
    readonly property real measuredDistance: (changes, at(2))
    readonly property real line: Theme.rowHeight + 2 * Theme.spacing

    signal remove

    function at(column: int): real {
        return row.measurements ? Number(row.measurements.data(row.measurements.index(row.index, column))) : 0
    }
    function text(distance: real): string {
        return distance.toLocaleString(Qt.locale(), "f", 1)
    }

    height: narrow ? 2 * line - Theme.spacing : line

    Connections {
        target: row.measurements

        function onDataChanged() {
            row.changes++
        }
    }
    ElidedLabel {
        id: title

        x: Theme.margin
        width: (row.narrow ? button.x : model.x) - x - Theme.spacing
        height: row.line
        text: row.markers
        verticalAlignment: Text.AlignVCenter
    }
    Label {
        id: model

        x: row.narrow ? Theme.margin : field.x - width - Theme.spacing
        width: row.narrow ? field.x - x - Theme.spacing : row.numberWidth
        anchors.verticalCenter: field.verticalCenter
        text: row.narrow ? qsTr("Model %1").arg(row.text(row.modelDistance)) : row.text(row.modelDistance)
        color: row.narrow ? Theme.secondaryText : Theme.text
        elide: Text.ElideRight
        horizontalAlignment: row.narrow ? Text.AlignLeft : Text.AlignRight
    }
    PanelTextField {
        id: field

        x: button.x - width - Theme.spacing
        y: row.height - height - Math.round((row.line - height) / 2)
        width: row.numberWidth
        horizontalAlignment: TextInput.AlignRight
        committed: row.text(row.measuredDistance)
        problem: acceptableInput ? "" : qsTr("This is no distance.")
        validator: DoubleValidator {
            bottom: 0
            top: 100000
            notation: DoubleValidator.StandardNotation
        }
        Accessible.name: qsTr("Measured distance between %1, in mm").arg(row.markers)
        onEdited: text => row.measurements.setData(row.measurements.index(row.index, 2), Number.fromLocaleString(Qt.locale(), text))
    }
    IconButton {
        id: button

        x: row.width - width - Theme.spacing
        y: Math.round((row.line - height) / 2)
        symbol: "close"
        tip: qsTr("Remove the measurement between %1").arg(row.markers)
        onClicked: row.remove()
    }
}
