import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore.Panel 1.0

/// For how long a calibration that was cancelled is kept, in seconds.
RowLayout {
    id: control

    required property var parameter

    spacing: Theme.spacing

    NumberField {
        Layout.fillWidth: true
        Layout.minimumWidth: 0
        Layout.maximumWidth: 40 * Theme.unit
        number: Number(control.parameter.value)
        minimum: 0
        maximum: 3600
        decimals: 1
        enabled: control.parameter.editable !== false
        Accessible.name: qsTr("%1, in seconds").arg(control.parameter.label)
        onEdited: number => control.parameter.value = number
    }
    Label {
        text: qsTr("s")
        color: Theme.secondaryText
        Accessible.ignored: true
    }
    Item {
        Layout.fillWidth: true
    }
}
