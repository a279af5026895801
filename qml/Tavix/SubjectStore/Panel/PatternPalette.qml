import QtQuick

/// The active marker patterns, and none.
PalettePopup {
    id: patterns

    title: qsTr("Pattern")
    columns: 8
    choices: Array.from({
        "length": 65
    }, (_, place) => (place + 1) % 65)
    cell: Item {
        id: cell

        required property int modelData

        width: Theme.cellSize
        height: Theme.cellSize
        Accessible.role: Accessible.Button
        Accessible.name: modelData === 0 ? qsTr("No pattern") : qsTr("Pattern %1").arg(modelData)

        PatternChip {
            anchors.centerIn: parent
            pattern: cell.modelData
        }
    }
}
