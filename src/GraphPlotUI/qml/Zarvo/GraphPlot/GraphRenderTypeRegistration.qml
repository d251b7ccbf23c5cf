import QtQuick
import Zarvo.GraphPlot 1.0

// Stands in a render type and registers that with the framebuffer item that encloses it.
Item {
    id: root

    Component.onCompleted: {
        for (let item = root.parent; item; item = item.parent) {
            if (item instanceof GraphPlotFBO) {
                item.registerRenderType(root.parent)
                return
            }
        }
        console.warn(`${root.parent} is not a child of GraphPlotFBO, OpenGL rendering is disabled.`)
    }
}
