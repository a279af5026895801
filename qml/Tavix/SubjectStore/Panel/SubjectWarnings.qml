import QtQuick

/// The place at the end of a row where its warnings are told; it is there without any, so that rows line up.
Item {
    id: place

    required property var row

    implicitWidth: Theme.badgeWidth
    implicitHeight: Theme.rowHeight

    WarningBadge {
        id: badge

        readonly property var warnings: hovered ? place.row.warnings() : []

        anchors.verticalCenter: parent.verticalCenter
        count: place.row.subjectWarnings.length
        tip: warnings.map(warning => warning.text).join("\n")
        onClicked: place.row.warningsWanted(badge, place.row.warnings())
    }
}
