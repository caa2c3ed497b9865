import QtQuick
import QtQuick.Controls.Basic
import Quorl

// An orange thumb on a white track. Its owner decides where a move comes to rest.
Slider {
    id: slider

    // Where it is to stand.
    property real settledValue
    // A step of the page keys, in steps of the arrow keys.
    property int pageSteps: 8

    signal movedTo(real value)

    function settle() { value = settledValue }
    function moveBy(amount) {
        movedTo(Math.max(from, Math.min(to, value + amount)))
        settle()
    }

    implicitHeight: Theme.touch
    padding: 0
    activeFocusOnTab: true
    focusPolicy: Qt.StrongFocus
    onMoved: {
        movedTo(value)
        settle()
    }
    onSettledValueChanged: settle()
    Component.onCompleted: settle()
    Accessible.role: Accessible.Slider
    Keys.onPressed: event => {
        if (event.key === Qt.Key_PageUp)
            moveBy(stepSize * pageSteps)
        else if (event.key === Qt.Key_PageDown)
            moveBy(-stepSize * pageSteps)
        else if (event.key === Qt.Key_Home)
            moveBy(from - to)
        else if (event.key === Qt.Key_End)
            moveBy(to - from)
        else
            return
        event.accepted = true
    }

    background: Rectangle {
        y: (slider.height - height) / 2
        width: slider.width
        height: 6
        radius: 3
        color: "white"
        border.width: 1
        border.color: Theme.buttonNormal
    }
    handle: Rectangle {
        x: slider.visualPosition * (slider.width - width)
        y: (slider.height - height) / 2
        width: 28
        height: 28
        radius: 14
        color: slider.pressed ? Qt.darker(Theme.buttonSelected, 1.1) : Theme.buttonSelected

        Rectangle {
            anchors.fill: parent
            anchors.margins: -3
            radius: width / 2
            visible: slider.activeFocus && FocusRing.isShown
            color: "transparent"
            border.width: 2
            border.color: Theme.title
        }
    }
}
