import QtQuick
import Quorl

// Says what is missing and what brings it, in the place of the content. Not for what is about to come: it waits a
// moment.
Column {
    id: root

    property bool isShown: false
    property string title
    property string text

    width: Math.min(320, parent ? parent.width - 2 * Theme.margin : 0)
    spacing: Theme.grid
    visible: isShown && !delay.running

    Delay {
        id: delay

        duration: 300
        running: root.isShown
    }

    Text {
        objectName: "emptyTitle"
        width: parent.width
        text: root.title
        font.pixelSize: Theme.row
        font.weight: Font.DemiBold
        color: Theme.title
        horizontalAlignment: Text.AlignHCenter
        wrapMode: Text.Wrap
    }
    Text {
        width: parent.width
        visible: text !== ""
        text: root.text
        font.pixelSize: Theme.value
        color: Theme.header
        horizontalAlignment: Text.AlignHCenter
        wrapMode: Text.Wrap
    }
}
