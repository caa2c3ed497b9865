import QtQuick
import Quorl

// Stands over what is not there yet.
Item {
    id: spinning

    property bool isShowing: false
    property string text: "Loading..."

    visible: isShowing
    Accessible.role: Accessible.StaticText
    Accessible.name: text

    Rectangle {
        anchors.centerIn: parent
        width: content.width + 4 * Theme.margin
        height: content.height + 2 * Theme.margin
        radius: Theme.margin
        color: Theme.card

        Column {
            id: content

            anchors.centerIn: parent
            spacing: Theme.grid * 2

            Text {
                objectName: "spinningText"
                text: spinning.text
                textFormat: Text.PlainText
                font.pixelSize: Theme.row
                color: Theme.header
                Accessible.ignored: true
            }
            ActivityIndicator {
                anchors.horizontalCenter: parent.horizontalCenter
                style: ActivityIndicator.Large
                isAnimating: spinning.isShowing
            }
        }
    }
}
