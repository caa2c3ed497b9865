import QtQuick
import Quorl

// The header over a section of a list, which sticks to the top.
Rectangle {
    id: root

    property string text

    implicitHeight: label.implicitHeight + 3 * Theme.grid
    // Not quite opaque: of what jumps under an opaque item, software drawing leaves the traces.
    color: Qt.alpha(Theme.bar, 254 / 255)
    Accessible.role: Accessible.StaticText
    Accessible.name: text

    Text {
        id: label

        anchors.left: parent.left
        anchors.leftMargin: Theme.margin
        anchors.right: parent.right
        anchors.rightMargin: Theme.margin
        anchors.verticalCenter: parent.verticalCenter
        text: root.text
        font.pixelSize: Theme.section
        font.weight: Font.DemiBold
        color: Theme.header
        elide: Text.ElideMiddle
        textFormat: Text.PlainText
    }
    Separator {
        anchors.bottom: parent.bottom
    }
}
