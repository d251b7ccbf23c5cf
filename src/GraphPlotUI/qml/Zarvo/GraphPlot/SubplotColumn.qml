import QtQuick

// The subplots of a window, one above the other, with the time axis below. It fills the framebuffer item from (0, 0).
Item {
    id: root

    required property var subplotModel
    required property var traceManager
    property point valueRangeOverride: Qt.point(0, 0) // in force while its maximum exceeds its minimum

    readonly property real axisWidth: 80
    readonly property real timeAxisHeight: 48
    readonly property real spacing: 8
    readonly property int subplotWidth: Math.floor(width - axisWidth - spacing)
    readonly property int count: subplots.count

    readonly property real _subplotHeight: count === 0 ? 0 : Math.floor((height - timeAxisHeight) / count) - spacing
    readonly property bool _overridden: valueRangeOverride.y > valueRangeOverride.x

    Repeater {
        id: subplots
        model: root.subplotModel

        delegate: Subplot {
            required property int index
            required property var subplotTraces
            required property string subplotYAxisLabel
            required property string subplotYAxisUnits
            required property string subplotYAxisToolTip
            required property var subplotYAxisRange

            y: index * (root._subplotHeight + root.spacing) + root.spacing
            width: root.axisWidth + root.subplotWidth
            height: root._subplotHeight
            axisWidth: root.axisWidth
            screenOrigin: Qt.point(0, y)
            traceManager: root.traceManager
            traceIds: subplotTraces
            label: subplotYAxisLabel
            units: subplotYAxisUnits
            toolTip: subplotYAxisToolTip
            valueRange: root._overridden ? root.valueRangeOverride : subplotYAxisRange
        }
    }

    TimeAxis {
        x: root.axisWidth
        y: root.height - root.timeAxisHeight
        width: root.subplotWidth
        height: root.timeAxisHeight
        visible: root.count > 0
        screenRect: Qt.rect(x, y, width, height)
        traceManager: root.traceManager

        TimeRangeMouseArea {
            anchors.fill: parent
            traceManager: root.traceManager
        }
    }
}
