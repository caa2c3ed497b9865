import QtQuick
import Quorl

// A spinner with a text, 5 from it. A spinner that stands still is not shown.
Row {
    id: loading

    property string text
    property bool isAnimating: true

    spacing: 5
    Accessible.role: Accessible.StaticText
    Accessible.name: text

    ActivityIndicator {
        id: spinner

        anchors.verticalCenter: parent.verticalCenter
        visible: loading.isAnimating
        isAnimating: loading.isAnimating
    }
    Text {
        objectName: "loadingLabel"
        anchors.verticalCenter: parent.verticalCenter
        width: Math.min(implicitWidth, loading.parent
                        ? loading.parent.width - 2 * Theme.margin - (spinner.visible ? spinner.width + loading.spacing : 0)
                        : implicitWidth)
        text: loading.text
        textFormat: Text.PlainText
        wrapMode: Text.Wrap
        horizontalAlignment: Text.AlignLeft
        font.pixelSize: Math.round(18 * Theme.fontScale)
        font.weight: Font.Medium
        color: Theme.header
        Accessible.ignored: true
    }
}
