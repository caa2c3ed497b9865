import QtQuick
import Quorl

// A value, right-aligned. The digits of a number stand in columns of one width, so that values below each other
// compare at a glance and a changing one does not tremble. A longer text takes several lines, or elides in the middle.
Item {
    id: root

    property string text
    property bool wraps: false
    property color color: Theme.subtitleNumbers
    readonly property bool isNumber: text.length <= 20 && /^[+-]?\d[\d.,:]*(\u2009\S{1,5})?$/.test(text)
    // What it needs at most.
    readonly property real naturalWidth: isNumber ? digits.implicitWidth : plain.implicitWidth

    implicitWidth: naturalWidth
    implicitHeight: isNumber ? digits.implicitHeight : plain.implicitHeight

    FontMetrics {
        id: metrics

        font.pixelSize: Theme.value
        font.weight: Font.Medium
    }

    Row {
        id: digits

        anchors.right: parent.right
        anchors.verticalCenter: parent.verticalCenter
        visible: root.isNumber

        Repeater {
            model: root.isNumber ? root.text.length : 0

            Text {
                required property int index
                readonly property string character: root.text.charAt(index)

                text: character
                width: character >= "0" && character <= "9" ? Math.ceil(metrics.advanceWidth("0")) : implicitWidth
                horizontalAlignment: Text.AlignHCenter
                font: metrics.font
                color: root.color
                Accessible.ignored: true
            }
        }
    }

    Text {
        id: plain

        visible: !root.isNumber
        width: root.width
        anchors.verticalCenter: parent.verticalCenter
        // A list breaks behind its commas, an enumerator between its words.
        text: root.isNumber ? "" : root.wraps ? root.text.replace(/[,_]/g, "$&\u200b") : root.text
        font: metrics.font
        color: root.color
        horizontalAlignment: Text.AlignRight
        wrapMode: root.wraps ? Text.Wrap : Text.NoWrap
        elide: root.wraps ? Text.ElideNone : Text.ElideMiddle
        textFormat: Text.PlainText
        Accessible.ignored: true
    }
}
