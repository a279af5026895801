import QtQuick

/// A small line drawing that takes its colour from the theme and its size from the font.
Canvas {
    id: icon

    property string name
    property color colour: Theme.text

    implicitWidth: Theme.iconSize
    implicitHeight: Theme.iconSize
    onNameChanged: requestPaint()
    onColourChanged: requestPaint()
    onPaint: {
        const context = getContext("2d")
        context.reset()
        context.scale(width / 16, height / 16)
        context.strokeStyle = colour
        context.fillStyle = colour
        context.lineWidth = 1.6
        context.lineCap = "round"
        context.lineJoin = "round"
        icon.draw(context)
    }

    /// Lines through points in a square of 16 by 16.
    function lines(context: var, paths: var) {
        context.beginPath()
        for (const path of paths)
            path.forEach((point, place) => place ? context.lineTo(point[0], point[1]) : context.moveTo(point[0], point[1]))
        context.stroke()
    }

    function draw(context: var) {
        switch (name) {
        case "search":
            context.beginPath()
            context.arc(6.8, 6.8, 4.3, 0, 2 * Math.PI)
            context.stroke()
            return lines(context, [[[10.2, 10.2], [13.8, 13.8]]])
        case "close":
            return lines(context, [[[4, 4], [12, 12]], [[12, 4], [4, 12]]])
        case "plus":
            return lines(context, [[[8, 3], [8, 13]], [[3, 8], [13, 8]]])
        case "arrow":
            return lines(context, [[[6, 4], [10, 8], [6, 12]]])
        case "check":
            return lines(context, [[[3.5, 8.5], [6.8, 11.8], [12.5, 4.8]]])
        case "expand":
            return lines(context, [[[4, 3], [8, 7], [12, 3]], [[4, 9], [8, 13], [12, 9]]])
        case "collapse":
            return lines(context, [[[4, 7], [8, 3], [12, 7]], [[4, 13], [8, 9], [12, 13]]])
        case "more":
            for (const y of [3.4, 8, 12.6]) {
                context.beginPath()
                context.arc(8, y, 1.4, 0, 2 * Math.PI)
                context.fill()
            }
            return
        case "warning":
            lines(context, [[[8, 2.2], [14.4, 13.4], [1.6, 13.4], [8, 2.2], [14.4, 13.4]]])
            return lines(context, [[[8, 6.4], [8, 9.2]], [[8, 11.3], [8, 11.4]]])
        case "failure":
            context.beginPath()
            context.arc(8, 8, 6, 0, 2 * Math.PI)
            context.stroke()
            return lines(context, [[[8, 4.8], [8, 8.6]], [[8, 11], [8, 11.1]]])
        }
    }
}
