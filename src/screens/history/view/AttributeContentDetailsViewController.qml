import QtQuick
import Quorl

// One attribute over a day, a week or a month.
FocusScope {
    id: root

    required property AttributeContentDetailsBinding binding
    property var navigation
    readonly property string title: binding.title
    // The header over the graph is the screen's large title.
    readonly property string longTitle: binding.headerText

    objectName: "AttributeContentDetailsViewController"
    Component.onDestruction: binding.leave()

    SegmentedControl {
        id: segments

        objectName: "timeFrames"
        anchors.top: parent.top
        x: Theme.margin
        width: Math.min(480, parent.width - 2 * Theme.margin)
        labels: root.binding.segments
        currentIndex: root.binding.currentSegmentIndex
        onSelected: index => root.binding.selectSegment(index)
    }

    GraphPlot {
        anchors.top: segments.bottom
        anchors.topMargin: 2 * Theme.grid
        anchors.bottom: caption.top
        anchors.bottomMargin: Theme.grid
        x: Theme.margin
        width: parent.width - 2 * Theme.margin
        visible: root.binding.isLoaded && root.binding.emptyText === ""
        focus: true
        binding: root.binding
    }

    Text {
        id: caption

        objectName: "historyCaption"
        anchors.bottom: parent.bottom
        anchors.bottomMargin: Theme.margin
        x: Theme.margin
        width: parent.width - 2 * Theme.margin
        text: root.binding.captionText
        font.pixelSize: Theme.caption
        color: Theme.header
        elide: Text.ElideRight
    }

    EmptyState {
        objectName: "historyEmpty"
        anchors.centerIn: parent
        isShown: root.binding.emptyText !== ""
        title: root.binding.emptyText
    }

    SpinningView {
        anchors.fill: parent
        isShowing: !root.binding.isLoaded && !spinnerDelay.running

        Delay {
            id: spinnerDelay

            duration: 150
            running: true
        }
    }
}
