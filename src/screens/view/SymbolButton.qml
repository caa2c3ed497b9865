import QtQuick
import QtQuick.Templates as T
import Quorl

// A symbol that can be pressed. `text` is its name for a screen reader.
T.AbstractButton {
    id: button

    property string symbol
    property int symbolSize: 24
    property color tint: Theme.buttonSelected

    implicitWidth: Theme.touch
    implicitHeight: Theme.touch
    activeFocusOnTab: true
    opacity: enabled ? 1 : 0.4
    Accessible.role: Accessible.Button
    Accessible.name: text

    contentItem: Item {
        Symbol {
            objectName: "symbol"
            anchors.centerIn: parent
            size: button.symbolSize
            symbol: button.symbol
            color: button.tint
        }
    }
    background: Rectangle {
        anchors.fill: parent
        anchors.margins: Theme.grid / 2
        radius: width / 2
        color: button.pressed || button.hovered ? Theme.pressed : "transparent"
        border.width: button.activeFocus && FocusRing.isShown ? 2 : 0
        border.color: Theme.buttonSelected
    }

    Keys.onReturnPressed: clicked()
    Keys.onEnterPressed: clicked()
}
