import QtQuick
import Quorl

// The line above a list that tells how fresh it is. Items put into it stand at its end.
Item {
    id: root

    property string text
    default property alias trailing: trailingItems.data

    implicitHeight: Math.max(caption.implicitHeight + 2 * Theme.grid, trailingItems.height)

    Text {
        id: caption

        objectName: "refreshedLine"
        anchors.left: parent.left
        anchors.leftMargin: Theme.margin
        anchors.right: trailingItems.left
        anchors.rightMargin: Theme.grid
        anchors.verticalCenter: parent.verticalCenter
        text: root.text
        font.pixelSize: Theme.caption
        color: Theme.header
        wrapMode: Text.Wrap
        maximumLineCount: 2
        elide: Text.ElideRight
        textFormat: Text.PlainText
    }
    Row {
        id: trailingItems

        anchors.right: parent.right
        anchors.rightMargin: width > 0 ? Theme.grid : Theme.margin
        anchors.verticalCenter: parent.verticalCenter
    }
}
