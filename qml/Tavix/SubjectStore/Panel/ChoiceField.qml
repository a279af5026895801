import QtQuick

/// One of several names; shows a name also when it is none of the choices.
PanelComboBox {
    id: field

    property string chosen
    property string placeholder: qsTr("None")

    signal edited(string name)

    enabled: count > 0
    currentIndex: count > 0 ? field.find(field.chosen) : -1
    displayText: chosen !== "" ? chosen : count > 0 ? placeholder : qsTr("Nothing to choose from")
    unset: chosen === ""
    onActivated: index => {
        const name = field.textAt(index)
        field.currentIndex = Qt.binding(() => field.count > 0 ? field.find(field.chosen) : -1)
        if (name !== field.chosen)
            field.edited(name)
    }
}
