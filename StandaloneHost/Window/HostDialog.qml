import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore.Panel

/// A dialog in the middle of the window, never wider than it.
Dialog {
    id: dialog

    property real widest: 110 * Theme.unit

    anchors.centerIn: Overlay.overlay
    width: Math.min(Overlay.overlay ? Overlay.overlay.width - 4 * Theme.margin : 0, widest)
    modal: true
    focus: true
    closePolicy: Popup.CloseOnEscape
    padding: 2 * Theme.margin
    topPadding: Theme.margin

    background: Rectangle {
        color: Theme.surface
        border.color: Theme.line
        radius: Theme.radius
    }

    header: Label {
        text: dialog.title
        font.bold: true
        elide: Text.ElideRight
        padding: 2 * Theme.margin
        bottomPadding: 0
    }
}
