import QtQuick
import QtQuick.Templates as T
import Quorl

// A text that can be pressed.
T.AbstractButton {
    id: button

    property bool isFilled: false

    implicitWidth: Math.max(Theme.touch, label.implicitWidth + leftPadding + rightPadding)
    implicitHeight: Theme.touch
    leftPadding: 3 * Theme.grid
    rightPadding: 3 * Theme.grid
    activeFocusOnTab: true
    opacity: enabled ? 1 : 0.4
    Accessible.role: Accessible.Button
    Accessible.name: text

    contentItem: Text {
        id: label

        text: button.text
        font.pixelSize: Theme.value
        font.weight: Font.DemiBold
        color: button.isFilled ? Theme.background : Theme.buttonSelected
        horizontalAlignment: Text.AlignHCenter
        verticalAlignment: Text.AlignVCenter
        elide: Text.ElideRight
    }
    background: Rectangle {
        y: Theme.grid
        width: parent.width
        height: parent.height - 2 * Theme.grid
        radius: 2 * Theme.grid
        color: button.isFilled ? Theme.buttonSelected : button.pressed || button.hovered ? Theme.pressed : "transparent"
        opacity: button.isFilled && button.pressed ? 0.8 : 1
        border.width: button.activeFocus && FocusRing.isShown ? 2 : 0
        border.color: button.isFilled ? Theme.title : Theme.buttonSelected
    }

    Keys.onReturnPressed: clicked()
    Keys.onEnterPressed: clicked()
}
