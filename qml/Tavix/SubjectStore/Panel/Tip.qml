import QtQuick
import QtQuick.Controls

/// A tooltip in the panel's colours.
ToolTip {
    id: tip

    delay: Theme.tipDelay
    padding: Theme.unit
    leftPadding: Theme.margin
    rightPadding: Theme.margin
    contentItem: Text {
        width: Math.min(implicitWidth, 14 * Theme.rowHeight)
        text: tip.text
        wrapMode: Text.Wrap
        color: Theme.text
        font.pixelSize: Theme.smallFont
        textFormat: Text.PlainText
    }
    background: Rectangle {
        color: Theme.raised
        border.color: Theme.line
        radius: Theme.radius
    }
}
