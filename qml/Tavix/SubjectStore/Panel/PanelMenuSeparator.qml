import QtQuick
import QtQuick.Controls

/// A thin line between groups of commands.
MenuSeparator {
    property bool offered: true

    visible: offered
    height: offered ? implicitHeight : 0
    topPadding: Theme.unit / 2
    bottomPadding: Theme.unit / 2
    leftPadding: Theme.margin
    rightPadding: Theme.margin
    contentItem: Rectangle {
        implicitHeight: 1
        color: Theme.line
    }
}
