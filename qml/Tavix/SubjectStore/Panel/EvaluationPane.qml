import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore 1.0

/// Switches object evaluation, sets it, tells how far it is and which objects it has found to be alike.
ScrollPane {
    id: pane

    required property var panel

    readonly property var evaluation: panel ? panel.evaluation : null
    readonly property bool on: evaluation !== null && evaluation.enabled
    readonly property real done: SubjectStore.objectEvaluationProgressDone
    readonly property real total: SubjectStore.objectEvaluationProgressRequired
    property var pairs: []
    readonly property int mostShown: 100

    signal finished(var result)

    /// One line for each two objects, the closest first.
    function findPairs(): var {
        const found = new Map()
        for (const subject of SubjectStore.subjects()) {
            const name = SubjectStore.subjectName(subject)
            for (const match of pane.panel.confusableWith(subject)) {
                const key = [subject.toString(), match.id.toString()].sort().join()
                const known = found.get(key)
                if (!known || match.distance < known.distance)
                    found.set(key, { "id": subject, "name": name, "other": subject.equals(match.id) ? qsTr("itself, turned") : match.name, "distance": match.distance })
            }
        }
        return Array.from(found.values()).sort((one, other) => one.distance - other.distance)
    }

    function grouped(count: real): string {
        return count.toLocaleString(Qt.locale(), "f", 0)
    }

    emptyTitle: evaluation ? "" : qsTr("No evaluation")
    emptyText: qsTr("This host does not compare objects.")

    // All objects are asked: not for every change while many come.
    Timer {
        id: refresh

        interval: 300
        onTriggered: pane.pairs = pane.on ? pane.findPairs() : []
    }
    Connections {
        target: pane.panel
        enabled: pane.visible

        function onRevisionChanged() {
            if (!refresh.running)
                refresh.start()
        }
    }
    onVisibleChanged: {
        if (visible)
            refresh.start()
    }
    onOnChanged: refresh.start()

    ToggleSwitch {
        width: parent.width
        text: qsTr("Compare objects")
        on: pane.on
        Accessible.description: explanation.text
        onEdited: on => pane.finished(pane.evaluation.setEnabled(on))
    }
    Label {
        id: explanation

        width: parent.width
        text: qsTr("Finds objects whose markers are so much alike that one could be taken for the other, and warns of them.")
        color: Theme.secondaryText
        wrapMode: Text.Wrap
    }
    LabelledField {
        width: parent.width
        label: qsTr("Warn below (mm)")

        NumberField {
            number: pane.evaluation ? pane.evaluation.warningThreshold : 0
            minimum: 0
            maximum: 1000
            step: 0.5
            Accessible.name: qsTr("Warn below this distance, in mm")
            onEdited: number => pane.finished(pane.evaluation.setWarningThreshold(number))
        }
    }
    LabelledField {
        width: parent.width
        label: qsTr("Steps for a comparison, at most")

        NumberField {
            number: pane.evaluation ? pane.evaluation.maximumStepCount : 0
            minimum: 1
            maximum: 2e9
            decimals: 0
            step: 1000
            Accessible.name: qsTr("Steps for a comparison, at most")
            onEdited: number => pane.finished(pane.evaluation.setMaximumStepCount(number))
        }
    }
    PaneHeading {
        width: parent.width
        visible: pane.on
        text: qsTr("Progress")
        detail: pane.total > 0 ? qsTr("%1 of %2 comparisons").arg(pane.grouped(pane.done)).arg(pane.grouped(pane.total)) : qsTr("Waiting")
    }
    ProgressLine {
        width: parent.width
        visible: pane.on
        // A part of 1: a bar forgets a value that is beyond its end at the time.
        value: pane.total > 0 ? pane.done / pane.total : 0
        Accessible.name: qsTr("Progress of the comparisons")
    }
    PaneHeading {
        width: parent.width
        visible: pane.on
        text: qsTr("Objects that are alike")
        detail: pane.pairs.length > 0 ? pane.pairs.length : ""
    }
    Label {
        width: parent.width
        visible: pane.on && pane.pairs.length === 0
        text: pane.total > 0 && pane.done >= pane.total ? qsTr("None: all objects can be told apart.") : qsTr("None so far.")
        color: Theme.secondaryText
        wrapMode: Text.Wrap
    }
    ConfusableList {
        width: parent.width
        visible: pane.on
        panel: pane.panel
        matches: pane.pairs.slice(0, pane.mostShown)
        activation: qsTr("Select the object")
        onActivated: match => {
            pane.panel.select([pane.panel.itemOf(match.id)])
            SubjectStore.focusSubject(match.id)
        }
    }
    Label {
        width: parent.width
        visible: pane.on && pane.pairs.length > pane.mostShown
        text: qsTr("and %1 more").arg(pane.pairs.length - pane.mostShown)
        color: Theme.secondaryText
    }
}
