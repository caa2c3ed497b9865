import QtQuick
import Quorl

// The carrier bar: a tab for each SIM. It keeps its height without any.
Item {
    id: bar

    required property CarrierBarBinding binding

    readonly property real tabWidth: (width - 2 * Theme.margin) / Math.max(1, binding.count)

    Accessible.role: Accessible.PageTabList
    Accessible.name: "Carriers"

    Rectangle {
        visible: bar.binding.count > 0
        x: Theme.margin - 2
        width: parent.width - 2 * x
        height: bar.binding.tabHeight + 2
        anchors.verticalCenter: parent.verticalCenter
        radius: height / 2
        color: Theme.card
        border.width: 1
        border.color: Theme.line
    }

    // One shape that moves from tab to tab.
    Rectangle {
        id: capsule

        property real from: 0
        property real to: 0
        property real seconds: 0

        function place(): real { return from + (to - from) * bar.binding.springProgress(seconds) }
        function moveTo(index: int) {
            movement.stop()
            from = visible ? place() : index
            to = index
            seconds = 0
            movement.start()
        }

        objectName: "carrierCapsule"
        visible: bar.binding.litIndex >= 0
        x: Theme.margin + bar.tabWidth * place()
        width: bar.tabWidth
        height: bar.binding.tabHeight
        anchors.verticalCenter: parent.verticalCenter
        radius: height / 2
        color: Theme.capsule

        NumberAnimation on seconds {
            id: movement
            running: false
            from: 0
            to: bar.binding.springDurationS
            duration: Theme.duration(bar.binding.springDurationS * 1000)
        }
        Component.onCompleted: from = to = Math.max(0, bar.binding.litIndex)
    }

    Connections {
        target: bar.binding
        function onLitIndexChanged() {
            if (bar.binding.litIndex >= 0)
                capsule.moveTo(bar.binding.litIndex)
        }
    }

    Row {
        x: Theme.margin
        anchors.verticalCenter: parent.verticalCenter

        Repeater {
            model: bar.binding

            PlainButton {
                id: tab

                required property int index
                required property string title
                required property bool isSelected

                objectName: "carrierTab" + index
                width: bar.tabWidth
                height: bar.binding.tabHeight
                radius: height / 2
                text: title || "SIM " + (index + 1)
                onClicked: bar.binding.press(index)
                Accessible.role: Accessible.PageTab
                Accessible.selectable: true
                Accessible.selected: isSelected

                // Carriers of one name light up together; the moving shape is under one of them only.
                Rectangle {
                    z: -1
                    anchors.fill: parent
                    radius: tab.radius
                    color: Theme.capsule
                    visible: tab.isSelected && tab.index !== bar.binding.litIndex
                }
                contentItem: Text {
                    objectName: "carrierTitle" + tab.index
                    text: tab.title
                    textFormat: Text.PlainText
                    font.pixelSize: Theme.value
                    font.bold: true
                    color: tab.isSelected ? Theme.capsuleText : Theme.title
                    elide: Text.ElideMiddle
                    leftPadding: Theme.margin
                    rightPadding: Theme.margin
                    horizontalAlignment: Text.AlignHCenter
                    verticalAlignment: Text.AlignVCenter
                }
            }
        }
    }
}
