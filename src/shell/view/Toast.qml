import QtQuick
import Quorl

// A text banner over a screen, which its model takes away again.
Item {
    id: toast

    property bool isShowing: false
    property string text

    Rectangle {
        objectName: "toast"
        anchors.horizontalCenter: parent.horizontalCenter
        anchors.bottom: parent.bottom
        anchors.bottomMargin: 3 * Theme.margin
        width: Math.min(label.implicitWidth + 3 * Theme.margin, toast.width - 2 * Theme.margin)
        height: label.height + 5 * Theme.grid
        radius: height / 2
        color: Theme.title
        visible: opacity > 0
        opacity: toast.isShowing ? 1 : 0
        Accessible.role: Accessible.AlertMessage
        Accessible.name: toast.text

        Behavior on opacity {
            NumberAnimation {
                duration: Theme.duration(150)
            }
        }
        Text {
            id: label

            objectName: "toastText"
            anchors.centerIn: parent
            width: Math.min(implicitWidth, parent.width - 2 * Theme.margin)
            text: toast.text
            textFormat: Text.PlainText
            elide: Text.ElideRight
            font.pixelSize: Theme.value
            font.weight: Font.Medium
            color: Theme.background
            Accessible.ignored: true
        }
    }
}
