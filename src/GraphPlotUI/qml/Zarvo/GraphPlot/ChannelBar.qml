import QtQuick
import Zarvo.GraphPlot 1.0

// Plain boxes for what is plotted and how: types, formats, units, derivative, magnitude, layout.
Flow {
    id: root

    required property var manager
    required property var subplotManager
    required property var channelModel
    required property var keyModel

    readonly property string helpText:
        manager.channelSelectionHelp.selectionHelpText(manager.selectedChannelTypeModel.currentChannelType)

    padding: 4
    spacing: 4

    ChannelTypeBox {
        objectName: "selectedTypeBox"
        typeModel: root.manager.selectedChannelTypeModel
        prompt: qsTr("What to plot of the selection")
    }
    ChannelTypeBox {
        objectName: "globalTypeBox"
        typeModel: root.manager.globalChannelTypeModel
        prompt: qsTr("What to plot that needs no selection")
    }
    EnumBox {
        objectName: "rotationFormatBox"
        enumModel: root.manager.rotationFormatModel
        value: root.manager.rotationFormat
        prompt: qsTr("Form of rotations")
        onChosen: value => root.manager.rotationFormat = value
    }
    EnumBox {
        objectName: "rotationUnitsBox"
        enumModel: root.manager.rotationUnitsModel
        value: root.manager.rotationUnits
        prompt: qsTr("Unit of angles")
        onChosen: value => root.manager.rotationUnits = value
    }
    EnumBox {
        objectName: "lengthUnitsBox"
        enumModel: root.manager.lengthUnitsModel
        value: root.manager.lengthUnits
        prompt: qsTr("Unit of lengths")
        onChosen: value => root.manager.lengthUnits = value
    }
    EnumBox {
        objectName: "derivativeBox"
        enumModel: [
            { key: qsTr("No derivative"), value: 0 },
            { key: qsTr("1st derivative"), value: 1 },
            { key: qsTr("2nd derivative"), value: 2 }
        ]
        value: root.manager.derivativeOrder
        prompt: qsTr("Derivative with respect to time")
        onChosen: value => root.manager.derivativeOrder = value
    }
    EnumBox {
        objectName: "layoutBox"
        enumModel: root.subplotManager.subplotLayoutModesModel
        value: root.subplotManager.subplotLayoutMode
        prompt: qsTr("How traces share subplots")
        onChosen: value => root.subplotManager.subplotLayoutMode = value
    }
    SwitchBox {
        objectName: "byFrameBox"
        text: qsTr("Per frame")
        enabled: root.manager.derivativeOrder > 0
        on: root.manager.differentiateByFrame
        onSwitched: on => root.manager.differentiateByFrame = on
    }
    SwitchBox {
        objectName: "magnitudeBox"
        text: qsTr("Magnitude")
        enabled: root.manager.canComputeSelectionMagnitude
        on: root.manager.plotMagnitude
        onSwitched: on => root.manager.plotMagnitude = on
    }
    SwitchBox {
        objectName: "linkBox"
        text: qsTr("Follow selection")
        on: root.manager.selectionLinked
        onSwitched: on => root.manager.selectionLinked = on
    }
    SwitchBox {
        objectName: "pinBox"
        text: qsTr("Pin all")
        enabled: root.channelModel.haveActiveChannels
        on: root.channelModel.pinState === SubplotPinStates.AllPinned
        onSwitched: on => root.channelModel.setAllPinned(on)
    }
    SwitchBox {
        objectName: "keyBox"
        text: qsTr("Key")
        on: root.keyModel.showKey
        onSwitched: on => root.keyModel.showKey = on
    }
}
