import QtQuick
import QtQuick.Templates as T
import Quorl

// What stands behind a row that can be pressed: tinted while it is, framed while the keyboard is on it, and ended by a
// line.
Rectangle {
    id: background

    required property T.AbstractButton control
    // What the line leaves free on the left.
    property real inset: Theme.margin

    color: control.pressed ? Theme.pressed : "transparent"
    border.width: control.activeFocus && FocusRing.isShown ? 2 : 0
    border.color: Theme.buttonSelected

    Separator {
        anchors.bottom: parent.bottom
        inset: background.inset
    }
}
