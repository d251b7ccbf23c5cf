import QtQuick
import QtQuick.Controls.Basic

// A box for one value of an enumeration, whose model has the roles key and value.
ComboBox {
    id: root

    required property var enumModel
    required property int value
    required property string prompt

    signal chosen(int value)

    function _showValue() { currentIndex = indexOfValue(value) }

    model: enumModel
    textRole: "key"
    valueRole: "value"
    implicitWidth: 165
    implicitHeight: 28
    font.pixelSize: 12

    onActivated: root.chosen(currentValue)
    onValueChanged: _showValue()
    Component.onCompleted: _showValue()

    PlainToolTip {
        visible: root.hovered && !root.popup.visible
        text: root.prompt
    }
}
