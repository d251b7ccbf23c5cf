import QtQuick
import Zarvo.GraphPlot 1.0

// The scene of one graph window: all drawing goes through one framebuffer item, redrawn by its own clock.
Item {
    id: root

    property alias valueRangeOverride: column.valueRangeOverride

    GraphPlotFBO {
        id: graphPlotFbo
        anchors.fill: parent
        graphPlotContext: contextGraphPlot

        SubplotColumn {
            id: column
            anchors.fill: parent
            subplotModel: contextSubplotManager
            traceManager: contextTraceManager
        }

        Text {
            anchors.centerIn: parent
            width: parent.width - 40
            horizontalAlignment: Text.AlignHCenter
            wrapMode: Text.WordWrap
            visible: column.count === 0
            text: contextActiveChannelModel.count === 0 ? qsTr("No active channels - tick a channel to plot.")
                                                        : qsTr("No channel data available")
            color: "#d0d0d0"
            font.pixelSize: 14
        }
    }

    Binding {
        target: contextTraceManager
        property: "subplotWidth"
        value: column.subplotWidth
    }

    Timer {
        running: true
        repeat: true
        interval: {
            graphPlotFbo.update()
            return contextTraceManager.displayUpdatePeriodMillis
        }
        onTriggered: graphPlotFbo.update()
    }
}
