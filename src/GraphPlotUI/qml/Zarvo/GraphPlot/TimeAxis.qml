import QtQuick
import QtQuick.Window
import Zarvo.GraphPlot 1.0

// The time axis below the subplots: ticks by its render type, labels and title as text.
Item {
    id: root

    required property var traceManager
    property rect screenRect

    TimeAxisRenderType {
        id: axis
        anchors.fill: parent
        screenRect: root.screenRect
        devicePixelRatio: Screen.devicePixelRatio
        liveContext: root.traceManager.liveContext
        relativeTimeDisplay: root.traceManager.relativeTimeDisplay
        valueRange: root.traceManager.timeRange
        ticksOnFarEdge: false

        GraphRenderTypeRegistration {}
    }

    TickLabels {
        vertical: false
        renderType: axis
        length: root.width
        valueForTextFunc: time => root.traceManager.relativeTimeDisplay ? time : time + axis.latestFrameIndex
    }

    Text {
        anchors { bottom: parent.bottom; horizontalCenter: parent.horizontalCenter }
        text: root.traceManager.liveContext && root.traceManager.relativeTimeDisplay ? qsTr("Relative Time (Frames)")
                                                                                     : qsTr("Session Time (Frames)")
        textFormat: Text.PlainText
        color: "#d0d0d0"
        font.pixelSize: 12
    }
}
