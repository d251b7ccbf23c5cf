import QtQuick

// Pans the time range by dragging and zooms it by the wheel about the pointer; a double click shows the default range.
MouseArea {
    id: root

    required property var traceManager

    property point _startRange
    property real _startX

    function setRange(minimum, maximum) {
        root.traceManager.timeRange = Qt.point(minimum, maximum)
    }

    acceptedButtons: Qt.LeftButton | Qt.MiddleButton
    enabled: !traceManager.lockTimeRange && !traceManager.fitTimeRange

    onPressed: mouse => {
        _startX = mouse.x
        _startRange = root.traceManager.timeRange
    }
    onPositionChanged: mouse => {
        const shift = (_startX - mouse.x) * (_startRange.y - _startRange.x) / width
        root.setRange(_startRange.x + shift, _startRange.y + shift)
    }
    onDoubleClicked: root.traceManager.timeRange = root.traceManager.defaultTimeRange
    onWheel: wheel => {
        const range = root.traceManager.timeRange
        const factor = wheel.angleDelta.y < 0 ? 1.1 : 0.9
        const size = factor * (range.y - range.x)
        const fraction = wheel.x / width
        const minimum = range.x + fraction * (range.y - range.x) - fraction * size
        root.setRange(minimum, minimum + size)
    }
}
