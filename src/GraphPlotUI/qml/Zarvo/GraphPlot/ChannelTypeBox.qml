import QtQuick
import QtQuick.Controls.Basic

// A box for the types of one channel type model: headers by category, greyed where nothing is selected for a type.
ComboBox {
    id: root

    required property var typeModel
    required property string prompt

    model: typeModel
    textRole: "channelTypeDisplayName"
    implicitWidth: 190
    implicitHeight: 28
    font.pixelSize: 12
    currentIndex: typeModel.currentRowIndex
    displayText: typeModel.currentRowIndex === 0 && typeModel.autoDisplayChannelType !== ""
                 ? qsTr("Auto (%1)").arg(typeModel.autoDisplayChannelType) : currentText

    onActivated: index => {
        typeModel.currentRowIndex = index
        currentIndex = Qt.binding(() => typeModel.currentRowIndex)
    }

    delegate: ItemDelegate {
        id: row

        required property int index
        required property string channelTypeDisplayName
        required property bool channelTypeCategoryHeader
        required property bool channelTypeAvailable

        width: ListView.view ? ListView.view.width : 0
        height: 26
        contentItem: Text {
            text: row.channelTypeDisplayName
            textFormat: Text.PlainText
            font: row.font
            elide: Text.ElideRight
            verticalAlignment: Text.AlignVCenter
            color: row.highlighted ? row.palette.highlightedText : row.palette.text
        }
        enabled: !channelTypeCategoryHeader
        highlighted: ListView.isCurrentItem
        opacity: channelTypeCategoryHeader || channelTypeAvailable ? 1 : 0.5
        leftPadding: channelTypeCategoryHeader ? 6 : 16
        font.bold: channelTypeCategoryHeader
        font.pixelSize: 12
    }

    PlainToolTip {
        visible: root.hovered && !root.popup.visible
        text: root.prompt
    }
}
