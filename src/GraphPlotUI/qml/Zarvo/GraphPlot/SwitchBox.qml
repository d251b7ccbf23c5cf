import QtQuick
import QtQuick.Controls.Basic

// A check box for a property that others change too.
CheckBox {
    id: root

    required property bool on

    signal switched(bool on)

    implicitHeight: 28
    font.pixelSize: 12
    palette.windowText: enabled ? "#e0e0e0" : "#808080"
    checked: on
    onToggled: {
        root.switched(checked)
        checked = Qt.binding(() => root.on)
    }
}
