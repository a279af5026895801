import QtQuick

/// The patterns of an object's clusters, as many as there is room for.
Row {
    id: chips

    property var patterns: []
    property int most: 4

    readonly property int hidden: Math.max(0, patterns.length - most)

    spacing: Math.max(3, Theme.unit / 2)

    Repeater {
        model: chips.patterns.slice(0, chips.hidden > 0 ? chips.most - 1 : chips.most)

        PatternChip {
            required property var modelData

            pattern: modelData
        }
    }

    Text {
        anchors.verticalCenter: parent.verticalCenter
        visible: chips.hidden > 0
        text: "+" + (chips.hidden + 1)
        color: Theme.secondaryText
        font.pixelSize: Theme.smallFont
    }
}
