import QtQuick
import Tavix.SubjectStore.Controls 1.0

/// The settings with which subjects are made.
ScrollPane {
    id: pane

    required property var panel

    signal finished(var result)

    SubjectStoreSetupWidget {
        width: parent.width
        panel: pane.panel
        onFinished: result => pane.finished(result)
    }
}
