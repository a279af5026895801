import QtQuick
import QtQuick.Controls
import Tavix.SubjectStore 1.0
import "MarkerProjection.js" as Projection

/// The markers of an object in space, and beneath them the objects that it can be confused with. Choosing one of these
/// draws its markers as rings over the object's own.
Column {
    id: view

    required property var panel
    /// The id of the object, or null.
    property var subject: null
    property string name
    /// Whether somebody looks: the store is not asked otherwise.
    property bool live: true

    readonly property var markers: subject && live ? (panel.revision, panel.markers(subject)) : []
    readonly property var confusable: subject && live ? (panel.revision, panel.confusableWith(subject)) : []
    property var compared: null
    readonly property var comparedMatch: compared ? confusable.find(match => match.id.equals(compared)) || null : null
    readonly property int markerCount: markers.length
    readonly property int patternCount: markers.filter(marker => marker.pattern > 0).length

    onSubjectChanged: compared = null
    spacing: Theme.margin

    PaneHeading {
        width: parent.width
        text: qsTr("Markers")
        detail: view.patternCount > 0 ? qsTr("%1, %2 with a pattern").arg(view.markers.length).arg(view.patternCount) : view.markers.length
    }
    MarkerScene {
        width: parent.width
        height: Math.max(50 * Theme.unit, Math.min(width * 0.75, 90 * Theme.unit))
        name: view.name
        markers: view.markers
        rings: view.comparedMatch ? Projection.centredOn(view.panel.markers(view.comparedMatch.id), view.markers) : []
    }
    Label {
        width: parent.width
        visible: view.subject !== null && (view.panel.revision, SubjectStore.smartClusterCount(view.subject) > 1)
        text: qsTr("Clusters side by side: where they sit on the object is not known.")
        color: Theme.secondaryText
        font.pixelSize: Theme.smallFont
        wrapMode: Text.Wrap
    }
    PaneHeading {
        width: parent.width
        text: qsTr("Can be confused with")
        detail: view.confusable.length > 0 ? view.confusable.length : ""
    }
    Label {
        width: parent.width
        visible: view.confusable.length === 0
        text: view.panel && view.panel.evaluation && !view.panel.evaluation.enabled ? qsTr("Objects are not compared: evaluation is off.") : qsTr("No other object, as far as compared.")
        color: Theme.secondaryText
        wrapMode: Text.Wrap
    }
    ConfusableList {
        width: parent.width
        panel: view.panel
        matches: view.confusable
        chosen: view.comparedMatch ? view.comparedMatch.id : null
        onActivated: match => view.compared = view.comparedMatch && match.id.equals(view.comparedMatch.id) ? null : match.id
    }
    Label {
        width: parent.width
        visible: view.comparedMatch !== null
        text: view.comparedMatch ? qsTr("Rings: the markers of %1 in its own pose, moved onto the middle of this object.").arg(view.comparedMatch.name) : ""
        textFormat: Text.PlainText
        color: Theme.secondaryText
        font.pixelSize: Theme.smallFont
        wrapMode: Text.Wrap
    }
}
