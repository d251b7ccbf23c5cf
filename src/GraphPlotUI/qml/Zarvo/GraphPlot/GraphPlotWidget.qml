import QtQuick
import Zarvo.GraphPlot 1.0

// The scene of one graph window: the channel bar above, the key at the right, and between them one framebuffer item in
// which all drawing is done, redrawn by its own clock where anything has changed.
Item {
    id: root

    property alias valueRangeOverride: column.valueRangeOverride

    Rectangle {
        anchors.fill: parent
        color: "#202020"
    }

    ChannelBar {
        id: bar
        width: parent.width
        manager: contextActiveChannelManager
        subplotManager: contextSubplotManager
        channelModel: contextActiveChannelModel
        keyModel: contextKeyModel
    }

    GraphPlotFBO {
        id: graphPlotFbo
        anchors { top: bar.bottom; bottom: parent.bottom; left: parent.left; right: keyList.left }
        graphPlotContext: contextGraphPlot

        SubplotColumn {
            id: column
            anchors.fill: parent
            subplotModel: contextSubplotManager.subplotModel
            traceManager: contextTraceManager
        }

        Text {
            anchors.centerIn: parent
            width: parent.width - 40
            horizontalAlignment: Text.AlignHCenter
            wrapMode: Text.WordWrap
            visible: column.count === 0
            text: contextActiveChannelModel.haveActiveChannels ? qsTr("No channel data available") : bar.helpText
            textFormat: Text.PlainText
            color: "#d0d0d0"
            font.pixelSize: 14
        }
    }

    KeyList {
        id: keyList
        anchors { top: bar.bottom; bottom: parent.bottom; right: parent.right }
        width: contextKeyModel.showKey && count > 0 ? Math.min(220, root.width / 3) : 0
        keyModel: contextKeyModel
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
            graphPlotFbo.updateIfChanged()
            return contextTraceManager.displayUpdatePeriodMillis
        }
        onTriggered: graphPlotFbo.updateIfChanged()
    }
}
