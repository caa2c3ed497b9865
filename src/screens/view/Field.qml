import QtQuick
import QtQuick.Controls.Basic
import Quorl

// A line of text that can be typed.
TextField {
    id: field

    height: Theme.touch
    leftPadding: 3 * Theme.grid
    rightPadding: 3 * Theme.grid
    font.pixelSize: Theme.row
    color: Theme.title
    placeholderTextColor: Theme.header
    selectByMouse: true

    background: Rectangle {
        radius: 2 * Theme.grid
        color: Theme.card
        border.width: field.activeFocus ? 2 : 1
        border.color: field.activeFocus ? Theme.buttonSelected : Theme.line
    }
}
