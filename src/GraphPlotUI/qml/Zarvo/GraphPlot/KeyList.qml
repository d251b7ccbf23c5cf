import QtQuick
import QtQuick.Controls.Basic

// The key as a list: colour, channel and component of each trace. A click on the mark at the right pins the channel.
ListView {
    id: root

    required property var keyModel

    model: keyModel
    clip: true
    visible: width > 0
    boundsBehavior: Flickable.StopAtBounds
    ScrollBar.vertical: ScrollBar {}

    delegate: Item {
        id: row

        required property var model

        width: ListView.view.width
        height: 22
        opacity: model.keyMissingData ? 0.4 : 1

        Rectangle {
            id: swatch
            x: 6
            width: 14
            height: 3
            anchors.verticalCenter: parent.verticalCenter
            color: row.model.keyColour ?? "transparent"
        }
        Text {
            id: name
            anchors { left: swatch.right; leftMargin: 6; right: pin.left; rightMargin: 6; verticalCenter: parent.verticalCenter }
            text: row.model.keyComponentName ? `${row.model.keyChannelName} : ${row.model.keyComponentName}`
                                             : row.model.keyChannelName
            textFormat: Text.PlainText
            elide: Text.ElideMiddle
            color: "#d0d0d0"
            font.pixelSize: 11

            HoverHandler { id: hover }
            PlainToolTip {
                visible: hover.hovered && name.truncated
                text: name.text
            }
        }
        Text {
            id: pin
            anchors { right: parent.right; rightMargin: 8; verticalCenter: parent.verticalCenter }
            text: row.model.keyPinned ? "\u25cf" : "\u25cb"
            textFormat: Text.PlainText
            color: "#d0d0d0"
            font.pixelSize: 12

            TapHandler { onTapped: row.model.keyPinned = !row.model.keyPinned }
        }
    }
}
