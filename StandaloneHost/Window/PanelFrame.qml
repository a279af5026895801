import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore.Panel

/// Shows the operator's panel, or why there is none.
Pane {
    id: frame

    required property var host

    padding: 0
    background: Rectangle {
        color: Theme.window
    }

    Loader {
        id: loader
        anchors.fill: parent
        source: frame.host.panel
        focus: true
    }

    ColumnLayout {
        visible: loader.status !== Loader.Ready
        anchors.centerIn: parent
        width: Math.min(parent.width - 4 * Theme.margin, 140 * Theme.unit)
        spacing: 2 * Theme.spacing

        Label {
            text: loader.status === Loader.Error ? "The panel cannot be shown" : "There is no panel"
            font.pixelSize: Math.round(Theme.metrics.height * 1.3)
            horizontalAlignment: Text.AlignHCenter
            wrapMode: Text.Wrap
            Layout.fillWidth: true
        }

        Label {
            text: loader.status === Loader.Error
                  ? "The log says what is wrong with it. Remote clients are served all the same."
                  : "The plugin that is loaded brings none. Remote clients are served all the same."
            color: Theme.secondaryText
            horizontalAlignment: Text.AlignHCenter
            wrapMode: Text.Wrap
            Layout.fillWidth: true
        }

        Button {
            text: "Show the log"
            visible: loader.status === Loader.Error && !frame.host.settings.logVisible
            onClicked: frame.host.settings.logVisible = true
            Layout.alignment: Qt.AlignHCenter
        }
    }
}
