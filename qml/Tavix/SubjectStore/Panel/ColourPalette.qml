import QtQuick

/// Twenty-four colours that are told apart on a dark and on a light stage.
PalettePopup {
    id: colours

    title: qsTr("Colour")
    columns: 8
    choices: {
        const made = []
        for (const [saturation, lightness] of [[0.75, 0.62], [0.65, 0.45], [0.4, 0.7]])
            for (let hue = 0; hue < 8; ++hue)
                made.push(Qt.hsla(hue / 8, saturation, lightness, 1).toString().replace("#", "#ff"))
        return made
    }
    cell: Item {
        id: cell

        required property string modelData

        width: Theme.cellSize
        height: Theme.cellSize
        Accessible.role: Accessible.Button
        Accessible.name: modelData

        ColourSwatch {
            anchors.fill: parent
            anchors.margins: Theme.unit
            colour: cell.modelData
        }
    }
}
