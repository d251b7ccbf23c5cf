import QtQuick

// Texts at the major divisions of an axis. Positions count pixels from the axis' minimum.
Repeater {
    id: root

    required property bool vertical
    required property var renderType // an axis render type
    property var valueForTextFunc: value => value
    property real length: 0 // pixels along the axis

    readonly property real _division: renderType.majorDivisionSize
    readonly property point _range: renderType.valueRange
    readonly property int _order: Math.floor(Math.log(_division) / Math.LN10 + 1e-9)
    readonly property int _precision: _order >= 0 ? 0 : -_order

    function textOf(value) {
        if (Math.abs(value) < 0.1 * _division)
            return "0"
        const magnitude = Math.abs(value)
        if (magnitude >= 1e-6 && magnitude <= 1e8)
            return value.toLocaleString(Qt.locale("C"), 'f', _precision)
        return value.toLocaleString(Qt.locale("C"), 'e', 2).replace("E", "e")
    }

    // A guard against bad values bounds the number of labels.
    model: _division > 0 ? Math.min(100, Math.ceil((_range.y - _range.x) / _division) + 2) : 0

    delegate: Text {
        required property int index
        readonly property real value: root.renderType.majorTickStart + index * root._division
        readonly property real position: (value - root._range.x) / (root._range.y - root._range.x) * root.length

        visible: position >= 0 && position <= root.length
        text: root.textOf(root.valueForTextFunc(value))
        textFormat: Text.PlainText
        color: "#d0d0d0"
        font.pixelSize: 11
        x: root.vertical ? parent.width - width - 14 : Math.max(0, Math.min(root.length - width, position - width / 2))
        y: root.vertical ? Math.max(0, Math.min(root.length - height, root.length - position - height / 2)) : 12
    }
}
