import QtQuick
import QtQuick.Templates as T
import Quorl

// Bars over a baseline, with a value axis on the left and times below. A press or the arrow keys select a bar.
FocusScope {
    id: root

    required property AttributeContentDetailsBinding binding
    // Bars stand as far apart as a finger needs.
    readonly property real barPitch: Math.max(Theme.touch, binding.barWidth + Theme.grid)
    readonly property real labelHeight: metrics.height + 2 * Theme.grid
    readonly property real labelWidth: metrics.advanceWidth(binding.widestLabel)
    readonly property int labelStride: binding.labelStride(labelWidth, barPitch)

    FontMetrics {
        id: metrics

        font.pixelSize: Theme.caption
    }

    Binding {
        target: root.binding
        property: "plotHeight"
        value: plot.height
    }

    Item {
        id: plot

        anchors.left: parent.left
        anchors.right: parent.right
        anchors.top: parent.top
        anchors.bottom: parent.bottom
        anchors.bottomMargin: root.labelHeight

        Repeater {
            model: root.binding.ticks

            Item {
                required property var modelData

                y: modelData.y
                width: plot.width

                Separator {
                    inset: axis.width
                }
                Text {
                    objectName: "tick"
                    width: axis.width - 2 * Theme.grid
                    anchors.verticalCenter: parent.top
                    text: modelData.text
                    font.pixelSize: Theme.caption
                    color: Theme.header
                    horizontalAlignment: Text.AlignRight
                }
            }
        }

        Item {
            id: axis

            width: {
                let widest = 0
                for (const tick of root.binding.ticks)
                    widest = Math.max(widest, metrics.advanceWidth(tick.text))
                return Math.ceil(widest) + 2 * Theme.grid
            }
        }

        Separator {
            inset: axis.width
            y: root.binding.baseline
            color: Theme.header
        }
    }

    ListView {
        id: list

        objectName: "bars"
        x: axis.width
        width: parent.width - x
        height: parent.height
        orientation: ListView.Horizontal
        clip: true
        focus: true
        activeFocusOnTab: true
        model: root.binding.bars
        leftMargin: Math.max(0, (root.labelWidth - root.barPitch) / 2)
        rightMargin: leftMargin
        cacheBuffer: Math.max(0, root.labelWidth)
        boundsBehavior: Flickable.StopAtBounds
        highlightMoveDuration: Theme.duration(150)
        Accessible.role: Accessible.Chart
        Accessible.name: root.binding.headerText + ", " + root.binding.captionText
        onCurrentIndexChanged: if (activeFocus && currentIndex >= 0) root.binding.tapBar(currentIndex)
        onCountChanged: showLatest()
        onWidthChanged: showLatest()
        onRightMarginChanged: showLatest()
        Component.onCompleted: showLatest()

        // The latest reading, or the selected one, whatever room the axis and the window leave.
        function showLatest() {
            if (root.binding.selectedIndex < 0)
                positionViewAtEnd()
            else
                positionViewAtIndex(root.binding.selectedIndex, ListView.Contain)
        }

        delegate: T.AbstractButton {
            id: bar

            required property int index
            required property real barHeight
            required property string value
            required property string label
            required property bool selected

            objectName: "bar"
            width: root.barPitch
            height: ListView.view.height
            focusPolicy: Qt.NoFocus
            Accessible.role: Accessible.ListItem
            Accessible.name: value + ", " + label
            Accessible.selected: selected
            onClicked: {
                ListView.view.currentIndex = index
                root.binding.tapBar(index)
            }
            Keys.onReturnPressed: clicked()
            Keys.onEnterPressed: clicked()

            Rectangle {
                objectName: "barBody"
                x: (parent.width - width) / 2
                y: root.binding.baseline - Math.max(0, bar.barHeight)
                width: root.binding.barWidth
                height: Math.max(1, Math.abs(bar.barHeight))
                radius: Math.min(3, height / 2)
                color: bar.selected ? Theme.buttonSelected : Theme.subtitleNumbers
                opacity: bar.selected || root.binding.selectedIndex < 0 ? 1 : 0.55
            }
            Text {
                objectName: "barLabel"
                anchors.horizontalCenter: parent.horizontalCenter
                y: plot.height + Theme.grid
                // None that the edge would cut.
                visible: bar.index % root.labelStride === 0 && bar.x + x >= list.contentX
                         && bar.x + x + metrics.advanceWidth(bar.label) <= list.contentX + list.width
                text: bar.label
                font.pixelSize: Theme.caption
                color: bar.selected ? Theme.buttonSelected : Theme.header
            }
        }
    }

    // Value and time of the selected bar, above it.
    Rectangle {
        // A bar that was scrolled out of sight and comes back is another item.
        readonly property Item bar: root.binding.selectedIndex < 0 || list.contentX === undefined
                                    ? null : list.itemAtIndex(root.binding.selectedIndex)
        readonly property real middle: bar ? list.x + bar.x - list.contentX + bar.width / 2 : 0

        objectName: "selectedBubble"
        visible: bar !== null && middle > list.x && middle < root.width
        x: Math.max(list.x, Math.min(root.width - width, middle - width / 2))
        y: bar ? Math.max(0, root.binding.baseline - Math.max(0, bar.barHeight) - height - Theme.grid) : 0
        width: Math.max(bubbleValue.implicitWidth, bubbleTime.implicitWidth) + 4 * Theme.grid
        height: bubbleValue.implicitHeight + bubbleTime.implicitHeight + Theme.grid
        radius: Theme.grid
        color: Theme.background
        border.width: 1
        border.color: Theme.buttonSelected

        Text {
            id: bubbleValue

            objectName: "selectedValue"
            anchors.horizontalCenter: parent.horizontalCenter
            y: Theme.grid / 2
            text: root.binding.selectedValue
            font.pixelSize: Theme.value
            font.weight: Font.DemiBold
            color: Theme.title
        }
        Text {
            id: bubbleTime

            objectName: "selectedTime"
            anchors.horizontalCenter: parent.horizontalCenter
            anchors.top: bubbleValue.bottom
            text: root.binding.selectedTime
            font.pixelSize: Theme.caption
            color: Theme.header
        }
    }
}
