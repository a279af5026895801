import QtQuick

/// A combo box of a dialog: while it is closed, Enter is the dialog's.
PanelComboBox {
    id: box

    signal entered

    function enter(event: var) {
        event.accepted = !popup.visible
        if (!popup.visible)
            entered()
    }

    Keys.onReturnPressed: event => box.enter(event)
    Keys.onEnterPressed: event => box.enter(event)
}
