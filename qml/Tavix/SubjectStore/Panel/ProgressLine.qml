import QtQuick
import QtQuick.Controls

/// A thin bar that tells how far something is, or only that it goes on.
ProgressBar {
    id: bar

    /// What moves while it is not known how far it is.
    readonly property real piece: width * 0.35

    implicitHeight: Math.max(4, Theme.unit * 1.5)

    background: Rectangle {
        radius: height / 2
        color: Theme.line
    }
    contentItem: Item {
        clip: true

        Rectangle {
            width: bar.indeterminate ? bar.piece : bar.width * bar.visualPosition
            height: parent.height
            radius: height / 2
            color: Theme.running

            NumberAnimation on x {
                running: bar.indeterminate && bar.visible
                loops: Animation.Infinite
                from: -bar.piece
                to: bar.width
                duration: 1600
            }
        }
    }
}
