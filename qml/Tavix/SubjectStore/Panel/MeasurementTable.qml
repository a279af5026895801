import QtQuick
import QtQuick.Controls

/// The measurements of a scaling.
Item {
    id: table

    property var measurements: null
    readonly property alias count: list.count
    readonly property bool narrow: width < 80 * Theme.unit
    readonly property real numberWidth: narrow ? 20 * Theme.unit : Math.round(width * 0.26)
    property int changes: 0
    /// Whether every measurement has a distance.
    readonly property bool complete: {
        for (let row = 0; row < (changes, count); ++row) {
            if (!(measurements.data(measurements.index(row, 2)) > 0))
                return false
        }
        return true
    }

    signal remove(int row)

    Connections {
        target: table.measurements

        function onDataChanged() {
            table.changes++
        }
    }
    Rectangle {
        id: header

        width: parent.width
        height: Theme.rowHeight
        color: Theme.header
        border.color: Theme.line

        Label {
            x: Theme.margin
            anchors.verticalCenter: parent.verticalCenter
            text: qsTr("Markers")
            color: Theme.secondaryText
        }
        Label {
            anchors.right: measured.left
            anchors.rightMargin: Theme.spacing
            anchors.verticalCenter: parent.verticalCenter
            visible: !table.narrow
            width: table.numberWidth
            text: qsTr("Model (mm)")
            color: Theme.secondaryText
            elide: Text.ElideRight
            horizontalAlignment: Text.AlignRight
        }
        Label {
            id: measured

            // As wide as the fields and the buttons beneath it.
            anchors.right: parent.right
            anchors.rightMargin: Theme.rowHeight + Theme.unit + 2 * Theme.spacing + 1
            anchors.verticalCenter: parent.verticalCenter
            width: table.narrow ? implicitWidth : table.numberWidth
            text: qsTr("Measured (mm)")
            color: Theme.secondaryText
            elide: Text.ElideRight
            horizontalAlignment: Text.AlignRight
        }
    }
    Rectangle {
        anchors.top: header.bottom
        anchors.topMargin: -1
        anchors.bottom: parent.bottom
        width: parent.width
        color: Theme.surface
        border.color: Theme.line

        ListView {
            id: list

            anchors.fill: parent
            anchors.margins: 1
            clip: true
            boundsBehavior: Flickable.StopAtBounds
            model: table.measurements
            ScrollBar.vertical: ScrollBar {}
            Accessible.role: Accessible.Table
            Accessible.name: qsTr("Measurements")
            onCountChanged: positionViewAtEnd()

            // qmllint disable unqualified
            delegate: MeasurementRow {
                required property var model

                width: ListView.view.width
                measurements: table.measurements
                markers: model.display
                narrow: table.narrow
                numberWidth: table.numberWidth
                onRemove: table.remove(index)
            }
            // qmllint enable unqualified

            Label {
                anchors.centerIn: parent
                visible: list.count === 0
                text: qsTr("No measurements yet")
                color: Theme.secondaryText
            }
        }
    }
}
