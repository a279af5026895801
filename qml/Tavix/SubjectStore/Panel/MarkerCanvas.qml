import QtQuick
import "MarkerProjection.js" as Projection

/// Draws markers as a camera sees them: over a floor, with the axes of the object's frame, the far ones smaller and
/// paler.
Canvas {
    id: canvas

    property var eye
    property var around
    property var markers: []
    property var rings: []
    property int pointed: -1
    /// The distance of the floor's lines, in mm.
    property real step: 10
    readonly property bool dark: Theme.dark

    function faded(colour: color, depth: real): color {
        const far = 0.55 * Math.max(0, Math.min(1, (depth + 1) / 2))
        return Qt.tint(colour, Qt.rgba(Theme.surface.r, Theme.surface.g, Theme.surface.b, far))
    }

    function line(context: var, from: var, to: var, colour: color, width: real) {
        const first = Projection.project(canvas.eye, from)
        const second = Projection.project(canvas.eye, to)
        context.strokeStyle = colour
        context.lineWidth = width
        context.beginPath()
        context.moveTo(first.x, first.y)
        context.lineTo(second.x, second.y)
        context.stroke()
    }

    function drawFloor(context: var) {
        const radius = canvas.around.radius * 1.15
        // Not more lines than can be told apart.
        const step = Math.max(canvas.step, radius / 8)
        const low = { "x": Math.floor((canvas.around.centre.x - radius) / step), "y": Math.floor((canvas.around.centre.y - radius) / step) }
        const count = Math.ceil(2 * radius / step) + 1
        const z = canvas.around.floor
        const colour = Qt.alpha(Theme.line, 0.6)
        for (let i = 0; i <= count; ++i) {
            const x = (low.x + i) * step
            const y = (low.y + i) * step
            line(context, { "x": x, "y": low.y * step, "z": z }, { "x": x, "y": (low.y + count) * step, "z": z }, colour, 1)
            line(context, { "x": low.x * step, "y": y, "z": z }, { "x": (low.x + count) * step, "y": y, "z": z }, colour, 1)
        }
        for (const marker of canvas.markers)
            line(context, marker, { "x": marker.x, "y": marker.y, "z": z }, Qt.alpha(Theme.secondaryText, 0.45), 1)
    }

    function drawAxes(context: var) {
        const origin = { "x": 0, "y": 0, "z": 0 }
        const length = 0.45 * canvas.around.radius
        const axes = [["X", { "x": length, "y": 0, "z": 0 }, Theme.critical], ["Y", { "x": 0, "y": length, "z": 0 }, Theme.good], ["Z", { "x": 0, "y": 0, "z": length }, Theme.running]]
        context.font = "bold " + Theme.smallFont + "px sans-serif"
        context.textAlign = "center"
        context.textBaseline = "middle"
        for (const [name, end, colour] of axes) {
            line(context, origin, end, colour, 2)
            const beyond = Projection.project(canvas.eye, { "x": end.x * 1.18, "y": end.y * 1.18, "z": end.z * 1.18 })
            context.fillStyle = colour
            context.fillText(name, beyond.x, beyond.y)
        }
    }

    function drawMarker(context: var, spot: var, colour: color, pointed: bool) {
        const radius = 1.7 * Theme.unit * spot.size
        const shade = context.createRadialGradient(spot.x - radius / 3, spot.y - radius / 3, radius / 8, spot.x, spot.y, radius)
        const base = canvas.faded(colour, spot.depth)
        shade.addColorStop(0, Qt.lighter(base, 1.35))
        shade.addColorStop(1, Qt.darker(base, 1.15))
        context.fillStyle = shade
        context.beginPath()
        context.arc(spot.x, spot.y, radius, 0, 2 * Math.PI)
        context.fill()
        if (pointed) {
            context.strokeStyle = Theme.text
            context.lineWidth = 2
            context.beginPath()
            context.arc(spot.x, spot.y, radius + 2, 0, 2 * Math.PI)
            context.stroke()
        }
    }

    function drawRing(context: var, spot: var) {
        context.strokeStyle = canvas.faded(Theme.warning, spot.depth)
        context.lineWidth = 2
        context.beginPath()
        context.arc(spot.x, spot.y, 2.6 * Theme.unit * spot.size, 0, 2 * Math.PI)
        context.stroke()
    }

    renderStrategy: Canvas.Immediate
    onDarkChanged: requestPaint()
    onPaint: {
        const context = getContext("2d")
        context.reset()
        context.translate(-x, -y)
        drawFloor(context)
        drawAxes(context)
        const spots = canvas.markers.map((marker, index) => {
            const spot = Projection.project(canvas.eye, marker)
            const colour = marker.pattern > 0 ? Theme.patternColour(marker.pattern) : Theme.secondaryText
            return { "depth": spot.depth, "draw": () => drawMarker(context, spot, colour, index === canvas.pointed) }
        }).concat(canvas.rings.map(marker => {
            const spot = Projection.project(canvas.eye, marker)
            return { "depth": spot.depth, "draw": () => drawRing(context, spot) }
        }))
        spots.sort((one, other) => other.depth - one.depth).forEach(spot => spot.draw())
    }
}
