import QtQuick
import Quorl

// The tab bar: icons, and a marker under the chosen one.
Rectangle {
    id: bar

    required property MenuBarBinding binding

    height: binding.barHeight
    color: Theme.background
    Accessible.role: Accessible.PageTabList
    Accessible.name: "Tabs"

    Row {
        anchors.fill: parent

        Repeater {
            model: bar.binding

            PlainButton {
                id: cell

                required property int index
                required property string name
                required property string imageName
                required property string tint
                required property bool isSelected

                objectName: "menuCell" + index
                width: bar.binding.itemWidth(bar.width)
                height: bar.height
                text: name
                onClicked: bar.binding.press(index)
                Accessible.role: Accessible.PageTab
                Accessible.selectable: true
                Accessible.selected: isSelected
                contentItem: Item {
                    Symbol {
                        objectName: "menuIcon" + cell.index
                        anchors.centerIn: parent
                        symbol: cell.imageName
                        color: Theme.color(cell.tint)
                    }
                }
            }
        }
    }

    Rectangle {
        id: marker

        // Places in parts of the bar's width, so that a resize moves nothing else.
        property real from: 0
        property real to: 0
        property real part: 1

        function place(): real { return from + (to - from) * bar.binding.markerProgress(part) }
        function move() {
            movement.stop()
            from = place()
            to = bar.binding.markerX(1)
            part = 0
            movement.start()
        }

        objectName: "menuMarker"
        x: bar.width * place()
        anchors.bottom: parent.bottom
        width: bar.binding.itemWidth(bar.width)
        height: bar.binding.markerHeight
        color: Theme.buttonSelected

        NumberAnimation on part {
            id: movement
            running: false
            from: 0
            to: 1
            duration: Theme.duration(bar.binding.durationMs)
        }
        Component.onCompleted: from = to = bar.binding.markerX(1)
    }

    Connections {
        target: bar.binding
        function onSelected() { marker.move() }
    }
}
