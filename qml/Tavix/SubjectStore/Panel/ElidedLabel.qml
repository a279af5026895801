import QtQuick
import QtQuick.Controls

/// A text in one line; what does not fit shows in a tooltip.
Label {
    id: label

    textFormat: Text.PlainText
    color: Theme.text
    elide: Text.ElideRight

    HoverHandler {
        id: hover
    }
    Tip {
        visible: hover.hovered && label.truncated
        text: label.text
    }
}
