import QtQuick
import QtQuick.Controls.Basic
import QtQuick.Window
import Zarvo.GraphPlot 1.0

// The value axis to the left of a subplot: ticks by its render type, labels and title as text.
Item {
    id: root

    property rect screenRect
    property point valueRange
    property string label
    property string units // rich text in brackets, or empty
    property string toolTip

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

    Text {
        x: 2
        y: (root.height + width) / 2
        rotation: -90
        transformOrigin: Item.TopLeft
        width: Math.min(implicitWidth, root.height)
        elide: Text.ElideRight
        textFormat: Text.StyledText
        text: root.units === "" ? root.label : `${root.label} ${root.units}`
        color: "#d0d0d0"
        font.pixelSize: 12
    }

    HoverHandler { id: hover }
    ToolTip.visible: hover.hovered && toolTip !== ""
    ToolTip.delay: 600
    ToolTip.text: toolTip
}
