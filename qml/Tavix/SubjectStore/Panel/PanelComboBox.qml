import QtQuick
import QtQuick.Controls

/// A combo box that looks like the other fields.
ComboBox {
    id: field

    /// Nothing is chosen: the text is a hint only.
    property bool unset: false

    implicitHeight: Theme.rowHeight + Theme.unit
    implicitWidth: 30 * Theme.unit
    leftPadding: Theme.margin

    background: Rectangle {
        color: field.enabled ? field.down ? Theme.hovered : Theme.surface : Theme.raised
        radius: Theme.radius
        border.width: field.visualFocus ? 2 : 1
        border.color: field.visualFocus ? Theme.highlight : Theme.line
    }
    // qmllint disable unqualified
    delegate: ItemDelegate {
        id: choice

        required property int index

        width: ListView.view ? ListView.view.width : 0
        height: Theme.rowHeight
        leftPadding: Theme.margin
        rightPadding: Theme.margin
        topPadding: 0
        bottomPadding: 0
        text: field.textAt(index)
        highlighted: field.highlightedIndex === index
        hoverEnabled: field.hoverEnabled

        contentItem: ElidedLabel {
            text: choice.text
            font.bold: field.currentIndex === choice.index
            verticalAlignment: Text.AlignVCenter
        }
        background: Rectangle {
            color: choice.highlighted ? Theme.selected : "transparent"
        }
    }
    // qmllint enable unqualified
    popup: Popup {
        y: field.height
        width: field.width
        height: Math.min(contentItem.implicitHeight + 2, 12 * Theme.rowHeight)
        margins: Theme.spacing
        padding: 1

        contentItem: ListView {
            implicitHeight: contentHeight
            clip: true
            boundsBehavior: Flickable.StopAtBounds
            model: field.popup.visible ? field.delegateModel : null
            currentIndex: field.highlightedIndex
            highlightMoveDuration: 0
            ScrollBar.vertical: ScrollBar {}
        }
        background: Rectangle {
            color: Theme.raised
            border.color: Theme.line
        }
    }
    indicator: Icon {
        x: field.width - width - Theme.spacing
        y: Math.round((field.height - height) / 2)
        name: "arrow"
        rotation: 90
        colour: field.enabled ? Theme.secondaryText : Theme.disabledText
    }
    contentItem: Text {
        text: field.displayText
        font: field.font
        color: !field.enabled ? Theme.disabledText : field.unset ? Theme.secondaryText : Theme.text
        elide: Text.ElideRight
        verticalAlignment: Text.AlignVCenter
    }
}
