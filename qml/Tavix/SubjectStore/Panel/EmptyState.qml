import QtQuick

/// Why the list shows no subject.
Column {
    id: state

    property var rows

    readonly property bool filtered: rows ? rows.search !== "" || rows.onlyWarnings : false

    signal clearWanted

    spacing: Theme.margin

    Text {
        width: parent.width
        horizontalAlignment: Text.AlignHCenter
        wrapMode: Text.Wrap
        color: Theme.secondaryText
        textFormat: Text.PlainText
        text: !state.filtered ? qsTr("There are no subjects yet. Add one with the plus sign above.") : state.rows.search === "" ? qsTr("No subject has a warning.") : state.rows.onlyWarnings ? qsTr("No subject with a warning matches “%1”.").arg(state.rows.search) : qsTr("No subject matches “%1”.").arg(state.rows.search)
    }

    PanelButton {
        anchors.horizontalCenter: parent.horizontalCenter
        visible: state.filtered
        text: qsTr("Show all subjects")
        onClicked: state.clearWanted()
    }
}
