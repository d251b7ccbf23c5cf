import QtQuick
import QtQuick.Controls.Basic

// A tool tip that shows its text as it stands, whatever is in it: names come from files, messages and the host. Only a
// text that was made for it with marks, all else in it escaped, may be markedUp.
ToolTip {
    id: root

    property bool markedUp: false

    delay: 600
    contentItem: Text {
        text: root.text
        textFormat: root.markedUp ? Text.StyledText : Text.PlainText
        font: root.font
        wrapMode: Text.Wrap
        color: root.palette.toolTipText
    }
}
