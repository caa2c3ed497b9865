import QtQuick
import QtQuick.Controls.Basic
import Quorl

// Drives the capture of baseband logs: configuration and limits above, files in the middle, the three actions below.
FocusScope {
    id: root

    required property SondrelBinding binding
    property var navigation
    readonly property Flickable flickable: list

    // Without the height for both, the upper area scrolls with the files.
    readonly property bool isLow: height < upper.height + actions.height + 180
    readonly property int inset: 20

    objectName: "sondrel"
    // A window that becomes low shows its settings first.
    onIsLowChanged: Qt.callLater(list.positionViewAtBeginning)

    Binding {
        target: root.binding
        property: "highlightColor"
        value: Theme.buttonSelected.toString()
    }

    Rectangle {
        anchors.fill: parent
        color: Theme.background
    }

    ListView {
        id: list

        objectName: "fileList"
        anchors.top: parent.top
        anchors.topMargin: root.isLow ? 0 : upper.height
        anchors.bottom: actions.top
        width: parent.width
        clip: true
        activeFocusOnTab: true
        flickableDirection: Flickable.VerticalFlick
        boundsBehavior: Flickable.DragAndOvershootBounds
        model: root.binding.files
        header: Item {
            width: list.width
            height: 15 + (root.isLow ? upper.height : 0)
        }
        delegate: FavoritesTableCellV2 {
            required property int index
            required titleText
            required subtitleText
            required valueText

            objectName: "fileRow"
            width: ListView.view.width
            showsSeparator: false
            inset: root.inset

            Rectangle {
                anchors.fill: parent
                z: -1
                visible: parent.ListView.isCurrentItem && list.activeFocus
                color: Theme.card
            }
        }
        Accessible.role: Accessible.List
        Accessible.name: qsTr("Log files")
        ScrollIndicator.vertical: ScrollIndicator {}
    }

    Item {
        id: upper

        objectName: "captureSettings"
        parent: root.isLow && list.headerItem ? list.headerItem : root
        width: root.width
        height: Math.max(200, settings.height + 5)

        Column {
            id: settings

            anchors.top: parent.top
            anchors.topMargin: 5
            x: root.inset
            width: parent.width - 2 * root.inset

            PlainButton {
                id: configButton

                objectName: "configButton"
                width: parent.width
                height: Math.max(Theme.touch, configText.implicitHeight)
                text: root.binding.configPlainTitle
                onClicked: root.binding.tapConfig()
                contentItem: Item {
                    Text {
                        id: configText

                        objectName: "configTitle"
                        width: parent.width - chevron.width - Theme.grid
                        height: parent.height
                        verticalAlignment: Text.AlignVCenter
                        text: root.binding.configTitle
                        textFormat: Text.StyledText
                        fontSizeMode: Text.HorizontalFit
                        minimumPixelSize: Theme.caption
                        elide: Text.ElideRight
                        font.pixelSize: Theme.section
                        font.bold: true
                        color: Theme.title
                    }
                    Symbol {
                        id: chevron

                        anchors.right: parent.right
                        anchors.verticalCenter: parent.verticalCenter
                        symbol: "chevron.right"
                        size: 20
                        color: Theme.header
                    }
                }
            }
            CaptureLabel {
                objectName: "chunkLabel"
                width: parent.width
                text: root.binding.chunkLabel
                Accessible.name: root.binding.chunkPlainLabel
            }
            CaptureSliderView {
                objectName: "chunkSlider"
                width: parent.width
                from: root.binding.chunkMinimum
                to: root.binding.chunkMaximum
                stepSize: 32
                settledValue: root.binding.chunkValue
                onMovedTo: value => root.binding.moveChunkSlider(value)
                Accessible.name: root.binding.chunkPlainLabel
            }
            CaptureLabel {
                objectName: "maxLogsLabel"
                width: parent.width
                text: root.binding.maxLogsLabel
                Accessible.name: root.binding.maxLogsPlainLabel
            }
            CaptureSliderView {
                objectName: "maxLogsSlider"
                width: parent.width
                from: root.binding.maxLogsMinimum
                to: root.binding.maxLogsMaximum
                stepSize: 1
                pageSteps: 256
                settledValue: root.binding.maxLogsValue
                onMovedTo: value => root.binding.moveMaxLogsSlider(value)
                Accessible.name: root.binding.maxLogsPlainLabel
            }
        }
    }

    Item {
        anchors.top: parent.top
        anchors.topMargin: upper.height
        anchors.bottom: actions.top
        width: parent.width

        LoadingView {
            objectName: "captureLoading"
            anchors.centerIn: parent
            visible: root.binding.isLoadingShown
            isAnimating: root.binding.isLoadingAnimating
            text: root.binding.loadingText
        }
    }

    Item {
        id: actions

        anchors.bottom: parent.bottom
        width: parent.width
        height: 1 + 5 + startButton.implicitHeight + 5

        Rectangle {
            objectName: "captureSeparator"
            anchors.horizontalCenter: parent.horizontalCenter
            width: parent.width - 2 * root.inset
            height: 1
            color: Theme.buttonNormal
        }
        Row {
            id: stack

            readonly property real buttonWidth: (width - 2 * spacing) / 3

            x: 5
            y: 6
            width: parent.width - 10
            spacing: 10

            CaptureButton {
                id: startButton

                objectName: "startButton"
                width: stack.buttonWidth
                binding: root.binding
                kind: SondrelBinding.Start
                text: qsTr("Start")
            }
            CaptureButton {
                objectName: "stopButton"
                width: stack.buttonWidth
                binding: root.binding
                kind: SondrelBinding.Stop
                text: qsTr("Stop")
            }
            CaptureButton {
                objectName: "resetButton"
                width: stack.buttonWidth
                binding: root.binding
                kind: SondrelBinding.Reset
                text: qsTr("Reset")
            }
        }
    }

    CaptureChoice {
        binding: root.binding
        origin: startButton
    }
}
