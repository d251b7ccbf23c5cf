import QtQuick
import QtQuick.Window
import Zarvo.GraphPlot 1.0

// One subplot with its value axis. screenOrigin is where it stands in the framebuffer item.
Item {
    id: root

    required property var traceManager
    property point screenOrigin
    property real axisWidth: 80
    property real pixelRatio: 1
    property var traceIds
    property string label
    property string units
    property string toolTip
    property point valueRange

    ValueAxis {
        width: root.axisWidth
        height: root.height
        screenRect: Qt.rect(root.screenOrigin.x, root.screenOrigin.y, width, height)
        valueRange: root.valueRange
        label: root.label
        units: root.units
        toolTip: root.toolTip
    }

    Item {
        id: plotArea
        x: root.axisWidth
        width: root.width - root.axisWidth
        height: root.height

        SubplotRenderType {
            id: plot
            anchors.fill: parent
            screenRect: Qt.rect(root.screenOrigin.x + plotArea.x, root.screenOrigin.y, plotArea.width, plotArea.height)
            devicePixelRatio: Screen.devicePixelRatio
            liveContext: root.traceManager.liveContext
            relativeTimeDisplay: root.traceManager.relativeTimeDisplay
            valueRangeX: root.traceManager.timeRange
            valueRangeY: root.valueRange
            gapOpacity: root.traceManager.gapOpacity
            traceIds: root.traceIds

            GraphRenderTypeRegistration {}
        }

        TimeRangeMouseArea {
            anchors.fill: parent
            traceManager: root.traceManager
        }
    }
}
