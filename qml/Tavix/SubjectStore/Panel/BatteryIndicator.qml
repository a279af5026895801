import QtQuick

/// How full a battery is, and whether it is being charged.
Item {
    id: battery

    /// In percent.
    property int level: 0
    property bool charging: false
    readonly property color colour: charging ? Theme.running : level < 15 ? Theme.critical : level < 30 ? Theme.warning : Theme.secondaryText

    implicitWidth: Math.round(Theme.iconSize * 1.5)
    implicitHeight: Math.round(Theme.iconSize * 0.75)

    Rectangle {
        id: body

        width: parent.width - cap.width
        height: parent.height
        radius: Theme.radius
        color: "transparent"
        border.color: battery.colour

        Rectangle {
            x: 2
            y: 2
            width: (parent.width - 4) * Math.max(0, Math.min(100, battery.level)) / 100
            height: parent.height - 4
            radius: 1
            color: battery.colour
        }
    }
    Rectangle {
        id: cap

        anchors.left: body.right
        anchors.verticalCenter: body.verticalCenter
        width: 2
        height: Math.round(parent.height / 2)
        color: battery.colour
    }
    Canvas {
        anchors.fill: body
        visible: battery.charging
        onPaint: {
            const context = getContext("2d")
            context.reset()
            context.scale(width / 16, height / 10)
            context.beginPath();
            [[9.5, 0.5], [4.5, 5.8], [7.6, 5.8], [6.5, 9.5], [11.5, 4.2], [8.4, 4.2]].forEach((point, place) => place ? context.lineTo(point[0], point[1]) : context.moveTo(point[0], point[1]))
            context.closePath()
            context.fillStyle = Theme.text
            context.strokeStyle = Theme.surface
            context.lineWidth = 2
            context.stroke()
            context.fill()
        }
    }
}
