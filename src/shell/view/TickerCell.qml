import QtQuick
import Quorl

// One character of a ticker.
Text {
    property string digit
    property real fontSize: 40

    objectName: "numberLabel"
    text: digit
    textFormat: Text.PlainText
    horizontalAlignment: Text.AlignHCenter
    verticalAlignment: Text.AlignVCenter
    font.pixelSize: Math.round(fontSize * Theme.fontScale)
    font.weight: Font.Normal
    color: Theme.title
}
