import QtQuick
import Quorl

// The latest value of each attribute of a metric.
FocusScope {
    id: root

    required property MetricDetailsBinding binding
    property var navigation
    readonly property string title: binding.title
    readonly property Flickable flickable: list

    objectName: "MetricDetailsViewController"
    Component.onDestruction: binding.leave()

    Component {
        id: historyScreen

        AttributeContentDetailsViewController {}
    }

    Connections {
        target: root.binding
        function onOpenGraph(screen) {
            root.navigation.push(historyScreen, { binding: screen, navigation: root.navigation })
        }
    }

    RefreshedLine {
        id: lastSeenLine

        anchors.top: parent.top
        width: parent.width
        text: root.binding.lastSeenText

        Text {
            anchors.verticalCenter: parent.verticalCenter
            rightPadding: 3 * Theme.grid
            text: root.binding.tech
            font.pixelSize: Theme.caption
            font.weight: Font.DemiBold
            color: Theme.header
        }
    }
    Separator {
        id: line

        anchors.top: lastSeenLine.bottom
    }

    ListView {
        id: list

        objectName: "attributeList"
        anchors.top: line.bottom
        anchors.bottom: parent.bottom
        width: parent.width
        clip: true
        visible: !root.binding.showsSpinner
        model: root.binding.rows
        activeFocusOnTab: true
        focus: true
        boundsBehavior: Flickable.DragAndOvershootBounds
        Accessible.role: Accessible.List
        Accessible.name: root.binding.title

        section.property: "section"
        section.labelPositioning: ViewSection.InlineLabels | ViewSection.CurrentLabelAtStart
        section.delegate: SectionHeader {
            required property string section

            objectName: "sectionHeader"
            width: ListView.view.width
            height: section === "" ? 0 : implicitHeight
            visible: section !== ""
            text: section
        }

        delegate: AttributeRow {
            id: row

            required property int index
            required property bool bookmarked
            required property bool showsGraph

            required name
            required value
            objectName: "attributeRow"
            width: ListView.view.width
            wraps: true
            onCopyRequested: root.binding.longPress(index)

            Item {
                visible: root.binding.hasGraphs && !row.showsGraph
                width: Theme.touch
                height: Theme.touch
            }
            SymbolButton {
                objectName: "graphButton"
                visible: row.showsGraph
                activeFocusOnTab: row.ListView.isCurrentItem
                symbol: "arrow.right.circle"
                text: qsTr("History of %1").arg(row.name)
                onClicked: root.binding.tapGraph(row.index)
            }
            SymbolButton {
                objectName: "bookmarkButton"
                activeFocusOnTab: row.ListView.isCurrentItem
                symbol: row.bookmarked ? "bookmark.fill" : "bookmark"
                tint: row.bookmarked ? Theme.buttonSelected : Theme.buttonNormal
                text: row.bookmarked ? qsTr("Remove %1 from dashboard").arg(row.name)
                                     : qsTr("Pin %1 on dashboard").arg(row.name)
                onClicked: root.binding.tapBookmark(row.index)
            }
        }
    }

    SpinningView {
        objectName: "detailSpinner"
        anchors.fill: list
        isShowing: root.binding.showsSpinner && !spinnerDelay.running
        text: root.binding.spinnerText

        Delay {
            id: spinnerDelay

            duration: 150
            running: true
        }
    }

    EmptyState {
        objectName: "detailEmpty"
        anchors.centerIn: list
        isShown: list.count === 0 && !root.binding.showsSpinner
        title: qsTr("No readings yet.")
        text: qsTr("Attributes appear when the device sends “%1”.").arg(root.binding.title)
    }

    Toast {
        anchors.fill: parent
        isShowing: root.binding.isToastShowing
        text: root.binding.toastText
    }
}
