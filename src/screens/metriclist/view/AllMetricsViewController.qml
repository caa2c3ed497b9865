import QtQuick
import QtQuick.Templates as T
import Quorl

// Every metric of the subscription by technology.
FocusScope {
    id: root

    required property AllMetricsBinding binding
    property var navigation
    // The row whose detail is open is marked where the detail stands beside the list.
    readonly property bool showsSelection: Window.width >= Theme.wideWidth
    readonly property Flickable flickable: list

    objectName: "AllMetricsViewController"

    function openFilter() {
        filterBar.isOpen = true
        filterField.forceActiveFocus()
    }
    function closeFilter() {
        filterField.clear()
        filterBar.isOpen = false
        list.forceActiveFocus()
    }

    Component {
        id: detailScreen

        MetricDetailsViewController {}
    }

    Connections {
        target: root.binding
        function onOpenDetail(screen) {
            root.navigation.push(detailScreen, { binding: screen, navigation: root.navigation })
        }
    }

    Shortcut {
        enabled: root.visible
        sequences: [StandardKey.Find]
        onActivated: root.openFilter()
    }
    Shortcut {
        enabled: root.visible
        sequences: [StandardKey.Refresh]
        onActivated: root.binding.pullToRefresh()
    }

    RefreshedLine {
        id: refreshedLine

        anchors.top: parent.top
        width: parent.width
        text: root.binding.lastRefreshedText

        SymbolButton {
            objectName: "filterButton"
            symbol: "magnifyingglass"
            text: qsTr("Filter")
            onClicked: filterBar.isOpen ? root.closeFilter() : root.openFilter()
        }
        SymbolButton {
            objectName: "refreshButton"
            symbol: "arrow.clockwise"
            text: qsTr("Refresh")
            enabled: !root.binding.isRefreshing
            onClicked: root.binding.pullToRefresh()
        }
    }

    Item {
        id: filterBar

        property bool isOpen: false

        anchors.top: refreshedLine.bottom
        width: parent.width
        height: isOpen ? Theme.touch + Theme.grid : 0
        visible: isOpen

        Field {
            id: filterField

            objectName: "filterField"
            x: Theme.margin
            width: parent.width - x - clearButton.width - Theme.grid
            placeholderText: qsTr("Metric or technology")
            Accessible.name: qsTr("Filter")
            onTextChanged: root.binding.filterText = text
            // The shell's Escape goes back.
            Keys.onShortcutOverride: event => event.accepted = event.key === Qt.Key_Escape
            Keys.onEscapePressed: root.closeFilter()
            Keys.onDownPressed: list.forceActiveFocus()
        }
        SymbolButton {
            id: clearButton

            objectName: "closeFilterButton"
            anchors.right: parent.right
            anchors.rightMargin: Theme.grid
            symbol: "xmark"
            text: qsTr("Close filter")
            onClicked: root.closeFilter()
        }
    }

    ListView {
        id: list

        objectName: "metricsList"
        anchors.top: filterBar.bottom
        anchors.bottom: parent.bottom
        width: parent.width
        clip: true
        model: root.binding.rows
        activeFocusOnTab: true
        focus: true
        boundsBehavior: Flickable.DragAndOvershootBounds
        Accessible.role: Accessible.List
        Accessible.name: qsTr("All Metrics")

        readonly property real pullDistance: 64
        readonly property real pulled: originY - contentY
        onDragEnded: if (pulled >= pullDistance) root.binding.pullToRefresh()

        // In the room that a pull opens above the first row.
        Item {
            parent: list
            y: Math.min(0, list.pulled - height)
            width: list.width
            height: Theme.touch
            visible: list.pulled > 1

            Row {
                anchors.centerIn: parent
                spacing: 2 * Theme.grid

                Symbol {
                    anchors.verticalCenter: parent.verticalCenter
                    size: 16
                    symbol: "arrow.down"
                    color: hintText.color
                    rotation: list.pulled >= list.pullDistance ? 180 : 0

                    Behavior on rotation { RotationAnimation { duration: Theme.duration(150) } }
                }
                Text {
                    id: hintText

                    objectName: "pullHint"
                    text: root.binding.pullToRefreshHint
                    font.pixelSize: Theme.value
                    color: list.pulled >= list.pullDistance ? Theme.buttonSelected : Theme.header
                }
            }
        }

        section.property: "tech"
        section.labelPositioning: ViewSection.InlineLabels | ViewSection.CurrentLabelAtStart
        section.delegate: SectionHeader {
            required property string section

            objectName: "techHeader"
            width: ListView.view.width
            text: section
        }

        delegate: T.AbstractButton {
            id: row

            required property int index
            required property string tech
            required property string name
            required property string time
            readonly property bool isSelected: root.showsSelection && tech === root.binding.selectedTech
                                               && name === root.binding.selectedName
            readonly property bool isOneLine: width >= 480

            objectName: "metricRow"
            width: ListView.view.width
            implicitHeight: Math.max(Theme.touch + (isOneLine ? 0 : Theme.grid),
                                     nameText.implicitHeight + (isOneLine ? 0 : timeText.implicitHeight)
                                     + 2 * Theme.grid)
            leftPadding: Theme.margin
            rightPadding: 3 * Theme.grid
            Accessible.role: Accessible.ListItem
            Accessible.name: name
            Accessible.description: time
            Accessible.selected: isSelected
            onClicked: {
                ListView.view.currentIndex = index
                root.binding.select(index)
            }
            Keys.onReturnPressed: clicked()
            Keys.onEnterPressed: clicked()

            background: RowBackground {
                control: row
                color: row.pressed ? Theme.pressed : row.isSelected ? Theme.card : "transparent"

                Rectangle {
                    visible: row.isSelected
                    width: Theme.grid
                    height: parent.height
                    color: Theme.buttonSelected
                }
            }

            contentItem: Item {
                Text {
                    id: nameText

                    anchors.left: parent.left
                    anchors.right: row.isOneLine ? timeText.left : chevron.left
                    anchors.rightMargin: 2 * Theme.grid
                    y: row.isOneLine ? (parent.height - height) / 2
                                     : (parent.height - height - timeText.height) / 2
                    text: row.name
                    font.pixelSize: Theme.row
                    color: Theme.title
                    elide: Text.ElideMiddle
                    textFormat: Text.PlainText
                }
                Text {
                    id: timeText

                    x: row.isOneLine ? chevron.x - width - 2 * Theme.grid : 0
                    y: row.isOneLine ? (parent.height - height) / 2 : nameText.y + nameText.height
                    text: row.time
                    font.pixelSize: Theme.caption
                    color: Theme.subtitleNumbers
                    textFormat: Text.PlainText
                }
                Symbol {
                    id: chevron

                    anchors.right: parent.right
                    anchors.verticalCenter: parent.verticalCenter
                    size: 16
                    symbol: "chevron.right"
                    color: Theme.header
                }
            }
        }
    }

    ActivityIndicator {
        objectName: "refreshSpinner"
        anchors.horizontalCenter: list.horizontalCenter
        anchors.top: list.top
        anchors.topMargin: 2 * Theme.grid
        z: 2
        visible: root.binding.isRefreshing
        isAnimating: visible
    }

    EmptyState {
        objectName: "metricsEmpty"
        anchors.centerIn: list
        isShown: list.count === 0
        title: root.binding.filterText === "" ? qsTr("No readings yet.")
                                              : qsTr("No metric matches “%1”.").arg(root.binding.filterText)
        text: root.binding.filterText === "" ? qsTr("Metrics appear when the baseband sends them.")
                                             : qsTr("Names of metrics and of technologies are searched.")
    }
}
