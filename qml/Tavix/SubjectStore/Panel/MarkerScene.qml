import QtQuick
import "MarkerProjection.js" as Projection

/// Markers in space, drawn in perspective. The mouse and the arrow keys turn them, the wheel, + and - zoom, Page Up and
/// Page Down go from marker to marker, Home shows all as at first.
FocusScope {
    id: scene

    property string name
    /// {x, y, z, pattern} in mm
    property var markers: []
    /// Markers of another object, drawn as rings.
    property var rings: []
    property int pointed: -1

    readonly property var around: Projection.bounds(markers)
    readonly property var eye: Projection.camera(around, turn, elevation, zoom, width, height)
    readonly property real barLength: Projection.roundLength(Math.min(width / 3, 30 * Theme.unit), eye.scale)
    readonly property var drawn: markers.map(marker => Projection.project(eye, marker))

    property real turn: -0.6
    property real elevation: 0.45
    property real zoom: 1

    function turnBy(across: real, up: real) {
        scene.turn -= across
        scene.elevation = Math.max(-Math.PI / 2, Math.min(Math.PI / 2, scene.elevation + up))
    }
    function zoomBy(factor: real) {
        scene.zoom = Math.max(0.3, Math.min(12, scene.zoom * factor))
    }
    function reset() {
        scene.turn = -0.6
        scene.elevation = 0.45
        scene.zoom = 1
        scene.pointed = -1
    }
    function nearest(x: real, y: real): int {
        let found = -1
        let shortest = 4 * Theme.unit
        scene.drawn.forEach((spot, index) => {
            const away = Math.hypot(spot.x - x, spot.y - y)
            if (away < shortest) {
                shortest = away
                found = index
            }
        })
        return found
    }
    function markerText(index: int): string {
        const marker = scene.markers[index]
        if (!marker)
            return ""
        const pattern = marker.pattern > 0 ? qsTr("pattern %1").arg(marker.pattern) : qsTr("no pattern")
        const place = `${marker.x.toFixed(1)}, ${marker.y.toFixed(1)}, ${marker.z.toFixed(1)}`
        return qsTr("Marker %1, %2\n%3 mm").arg(index + 1).arg(pattern).arg(place)
    }

    activeFocusOnTab: true
    implicitHeight: 55 * Theme.unit
    Accessible.role: Accessible.Graphic
    Accessible.name: qsTr("Markers of %1").arg(name)
    Accessible.description: pointed < 0 ? qsTr("%n marker(s); arrow keys turn them, Page Down goes to the next", "", markers.length) : markerText(pointed)
    Accessible.focusable: true

    onMarkersChanged: {
        if (scene.pointed >= scene.markers.length)
            scene.pointed = -1
        canvas.requestPaint()
    }
    onRingsChanged: canvas.requestPaint()
    onEyeChanged: canvas.requestPaint()
    onPointedChanged: canvas.requestPaint()

    Keys.onPressed: event => {
        const step = Math.PI / 24
        const count = Math.max(1, scene.markers.length)
        event.accepted = true
        switch (event.key) {
        case Qt.Key_Left:
            return scene.turnBy(-step, 0)
        case Qt.Key_Right:
            return scene.turnBy(step, 0)
        case Qt.Key_Up:
            return scene.turnBy(0, step)
        case Qt.Key_Down:
            return scene.turnBy(0, -step)
        case Qt.Key_Plus:
        case Qt.Key_Equal:
            return scene.zoomBy(1.2)
        case Qt.Key_Minus:
            return scene.zoomBy(1 / 1.2)
        case Qt.Key_Home:
            return scene.reset()
        case Qt.Key_PageDown:
            scene.pointed = (scene.pointed + 1) % count
            return
        case Qt.Key_PageUp:
            scene.pointed = (Math.max(0, scene.pointed) + count - 1) % count
            return
        }
        event.accepted = false
    }

    Rectangle {
        anchors.fill: parent
        color: Theme.surface
        radius: Theme.radius
        border.width: scene.activeFocus ? 2 : 1
        border.color: scene.activeFocus ? Theme.highlight : Theme.line
    }
    MarkerCanvas {
        id: canvas

        anchors.fill: parent
        anchors.margins: 2
        eye: scene.eye
        around: scene.around
        markers: scene.markers
        rings: scene.rings
        pointed: scene.pointed
        step: scene.barLength
    }
    MouseArea {
        property point last
        /// When the pointer came, or the wheel was last turned without zooming.
        property double passed: 0

        anchors.fill: parent
        hoverEnabled: true
        preventStealing: true
        cursorShape: pressed ? Qt.ClosedHandCursor : Qt.OpenHandCursor
        onPressed: mouse => {
            scene.forceActiveFocus(Qt.MouseFocusReason)
            last = Qt.point(mouse.x, mouse.y)
        }
        onPositionChanged: mouse => {
            if (pressed) {
                scene.turnBy((mouse.x - last.x) / 100, (mouse.y - last.y) / 100)
                last = Qt.point(mouse.x, mouse.y)
            } else {
                scene.pointed = scene.nearest(mouse.x, mouse.y)
            }
        }
        onExited: scene.pointed = -1
        onDoubleClicked: scene.reset()
        onEntered: passed = Date.now()
        onWheel: wheel => {
            // Somebody who scrolls the pane and comes across goes on scrolling.
            wheel.accepted = scene.activeFocus || Date.now() - passed > 400
            if (wheel.accepted)
                scene.zoomBy(Math.pow(1.0015, wheel.angleDelta.y))
            else
                passed = Date.now()
        }
    }
    Row {
        anchors.top: parent.top
        anchors.right: parent.right
        anchors.margins: Theme.spacing

        GlyphButton {
            text: qsTr("Zoom in")
            glyph: "+"
            onClicked: scene.zoomBy(1.2)
        }
        GlyphButton {
            text: qsTr("Zoom out")
            glyph: "−"
            onClicked: scene.zoomBy(1 / 1.2)
        }
        GlyphButton {
            text: qsTr("Show all, as at first")
            glyph: "⌂"
            onClicked: scene.reset()
        }
    }
    Column {
        anchors.left: parent.left
        anchors.bottom: parent.bottom
        anchors.margins: Theme.margin
        spacing: Theme.spacing / 2

        Text {
            text: qsTr("%1 mm").arg(scene.barLength)
            color: Theme.secondaryText
            font.pixelSize: Theme.smallFont
        }
        Rectangle {
            width: scene.barLength * scene.eye.scale
            height: 2
            color: Theme.secondaryText
        }
    }
    Rectangle {
        readonly property var spot: scene.drawn[scene.pointed]

        visible: spot !== undefined
        x: visible ? Math.max(2, Math.min(parent.width - width - 2, spot.x + 3 * Theme.unit)) : 0
        y: visible ? Math.max(2, Math.min(parent.height - height - 2, spot.y - height - 2 * Theme.unit)) : 0
        width: label.implicitWidth + 2 * Theme.margin
        height: label.implicitHeight + Theme.margin
        radius: Theme.radius
        color: Theme.raised
        border.color: Theme.line

        Text {
            id: label

            anchors.centerIn: parent
            text: scene.markerText(scene.pointed)
            color: Theme.text
            font.pixelSize: Theme.smallFont
        }
    }
}
