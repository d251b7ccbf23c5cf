import QtQuick
import QtQuick.Window
import Zarvo.GraphPlot 1.0

// The value axis to the left of a subplot: ticks by its render type, labels and title as text.
Item {
    id: root

    property rect screenRect
    property point valueRange
    property string label
    property string units // rich text in brackets, or empty; what is not a mark in it is escaped
    property string toolTip // likewise

    ValueAxisRenderType {
        id: axis
        anchors.fill: parent
        screenRect: root.screenRect
        devicePixelRatio: Screen.devicePixelRatio
        valueRange: root.valueRange
        ticksOnFarEdge: true

        GraphRenderTypeRegistration {}
    }

    TickLabels {
        vertical: true
        renderType: axis
        length: root.height
    }

    Row {
        x: 2
        y: (root.height + width) / 2
        rotation: -90
        transformOrigin: Item.TopLeft
        spacing: root.units === "" ? 0 : 4

        Text {
            width: Math.min(implicitWidth, Math.max(0, root.height - parent.spacing - unitsText.width))
            elide: Text.ElideRight
            textFormat: Text.PlainText
            text: root.label
            color: "#d0d0d0"
            font.pixelSize: 12
        }
        Text {
            id: unitsText
            width: Math.min(implicitWidth, root.height)
            elide: Text.ElideRight
            textFormat: Text.StyledText
            text: root.units
            color: "#d0d0d0"
            font.pixelSize: 12
        }
    }

    HoverHandler { id: hover }
    PlainToolTip {
        markedUp: true
        visible: hover.hovered && text !== ""
        text: root.toolTip
    }
}
