import QtQuick
import Quorl

// One of the three actions. It blinks when it was pressed, and is never disabled.
PlainButton {
    id: button

    required property SondrelBinding binding
    required property int kind

    // How much of the blink has passed.
    property real blinkPart: 1

    implicitHeight: Math.max(Theme.touch, label.implicitHeight + 4 * Theme.grid)
    radius: 12
    opacity: down ? 0.5 : binding.opacityOfBlink(blinkPart)
    onClicked: binding.tap(kind)

    background: Rectangle {
        radius: button.radius
        color: button.hovered ? Theme.card : "transparent"
        border.width: button.activeFocus && FocusRing.isShown ? 3 : 1
        border.color: Theme.subtitleNumbers
    }
    contentItem: Text {
        id: label

        text: button.text
        textFormat: Text.PlainText
        horizontalAlignment: Text.AlignHCenter
        verticalAlignment: Text.AlignVCenter
        fontSizeMode: Text.HorizontalFit
        minimumPixelSize: Theme.caption
        font.pixelSize: Math.round(25 * Theme.fontScale)
        font.bold: true
        color: Theme.subtitleNumbers
    }

    Connections {
        target: button.binding
        function onBlinked(action) {
            if (action === button.kind)
                blink.restart()
        }
    }
    NumberAnimation {
        id: blink

        target: button
        property: "blinkPart"
        from: 0
        to: 1
        duration: Theme.duration(button.binding.blinkDurationMs)
    }
}
