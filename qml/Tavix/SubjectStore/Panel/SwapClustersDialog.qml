import QtQuick
import QtQuick.Layouts
import Tavix.SubjectStore

/// Exchanges a cluster of one smart object with one of another.
PanelDialog {
    id: dialog

    property var first
    property var second

    function ask(firstSubject: var, secondSubject: var) {
        first = firstSubject
        second = secondSubject
        one.currentIndex = 0
        // One object's clusters are swapped with each other.
        other.currentIndex = firstSubject.equals(secondSubject) ? 1 : 0
        show(one)
    }

    function labels(subject: var): var {
        const made = []
        for (let cluster = 0; subject && cluster < SubjectStore.smartClusterCount(subject); ++cluster)
            made.push(SubjectStore.smartClusterLabel(subject, cluster) || qsTr("Cluster %1").arg(cluster + 1))
        return made
    }

    title: qsTr("Swap clusters")
    acceptText: qsTr("Swap")
    acceptable: first !== undefined && one.currentIndex >= 0 && other.currentIndex >= 0 && !(first.equals(second) && one.currentIndex === other.currentIndex)
    onCommitted: finish(SubjectStore.swapSmartClusters(first, second, one.currentIndex, other.currentIndex))

    Text {
        Layout.fillWidth: true
        text: dialog.first ? SubjectStore.subjectName(dialog.first) : ""
        elide: Text.ElideRight
        color: Theme.secondaryText
        textFormat: Text.PlainText
    }

    DialogComboBox {
        id: one

        Layout.fillWidth: true
        focus: true
        model: dialog.labels(dialog.first)
        onEntered: dialog.commit()
        Accessible.name: qsTr("Cluster of the first object")
    }

    Text {
        Layout.fillWidth: true
        text: dialog.second ? SubjectStore.subjectName(dialog.second) : ""
        elide: Text.ElideRight
        color: Theme.secondaryText
        textFormat: Text.PlainText
    }

    DialogComboBox {
        id: other

        Layout.fillWidth: true
        model: dialog.labels(dialog.second)
        onEntered: dialog.commit()
        Accessible.name: qsTr("Cluster of the second object")
    }
}
