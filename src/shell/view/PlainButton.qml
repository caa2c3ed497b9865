import QtQuick
import QtQuick.Controls.Basic
import Quorl

// A button without looks of its own: what it shows is its contentItem. Keyboard, focus and screen reader are taken
// care of.
AbstractButton {
    id: button

    property color focusColor: Theme.buttonSelected
    property int radius: 8

    activeFocusOnTab: true
    focusPolicy: Qt.TabFocus
    opacity: down ? 0.5 : 1
    Accessible.role: Accessible.Button
    Accessible.name: text
    Accessible.onPressAction: button.clicked()
    Keys.onReturnPressed: button.clicked()
    Keys.onEnterPressed: button.clicked()

    background: Rectangle {
        radius: button.radius
        color: button.hovered && button.enabled ? Theme.bar : "transparent"
        border.width: button.activeFocus && FocusRing.isShown ? 2 : 0
        border.color: button.focusColor
    }
}
