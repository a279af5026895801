import QtQuick

/// Puts the selected objects into a group: none, one of those that there are, or a new one.
ChoiceMenu {
    id: owner

    property var groups: []

    signal groupChosen(string group)
    signal newWanted

    hasCurrent: true
    choices: {
        const made = groups.map(group => ({
                    "name": group,
                    "value": group
                }))
        return [
            {
                "name": qsTr("None"),
                "value": ""
            }
        ].concat(made, [
            {
                "name": qsTr("New…"),
                "value": undefined
            }
        ])
    }
    onChosen: value => value === undefined ? newWanted() : groupChosen(value)
}
