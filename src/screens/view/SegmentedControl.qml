import QtQuick
import QtQuick.Templates as T
import Quorl

// A choice of one among a few, side by side.
Item {
    id: root

    property var labels: []
    property int currentIndex: 0

    signal selected(int index)

    implicitHeight: Theme.touch
    Accessible.role: Accessible.PageTabList

    Rectangle {
        anchors.fill: parent
        anchors.topMargin: Theme.grid
        anchors.bottomMargin: Theme.grid
        radius: 2 * Theme.grid
        color: Theme.card
    }

    Row {
        anchors.fill: parent

        Repeater {
            model: root.labels

            T.AbstractButton {
                id: segment

                required property int index
                required property string modelData
                readonly property bool isCurrent: index === root.currentIndex
                readonly property bool isMarked: activeFocus && FocusRing.isShown

                objectName: "segment" + index
                width: root.width / root.labels.length
                height: root.height
                activeFocusOnTab: true
                text: modelData
                Accessible.role: Accessible.PageTab
                Accessible.name: text
                Accessible.selected: isCurrent
                onClicked: root.selected(index)
                Keys.onReturnPressed: clicked()
                Keys.onEnterPressed: clicked()

                contentItem: Text {
                    text: segment.text
                    font.pixelSize: Theme.value
                    font.weight: segment.isCurrent ? Font.DemiBold : Font.Normal
                    color: segment.isCurrent ? Theme.buttonSelected : Theme.content
                    horizontalAlignment: Text.AlignHCenter
                    verticalAlignment: Text.AlignVCenter
                    elide: Text.ElideRight
                }
                background: Item {
                    Rectangle {
                        anchors.fill: parent
                        anchors.margins: Theme.grid / 2
                        anchors.topMargin: 1.5 * Theme.grid
                        anchors.bottomMargin: 1.5 * Theme.grid
                        radius: 1.5 * Theme.grid
                        color: segment.isCurrent ? Theme.background : segment.pressed ? Theme.pressed : "transparent"
                        border.width: segment.isMarked ? 2 : segment.isCurrent ? 1 : 0
                        border.color: segment.isMarked ? Theme.buttonSelected : Theme.line
                    }
                }
            }
        }
    }
}
