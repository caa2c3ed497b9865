import QtQuick
import QtQuick.Templates as T
import Quorl

// Takes all rows of a time frame out of the device.
FocusScope {
    id: root

    required property ExportBinding binding
    property var navigation
    // With room for the loading view.
    readonly property real sheetHeight: options.y + options.height + 12 * Theme.grid + loading.height

    objectName: "ExportViewController"
    Component.onDestruction: binding.leave()
    Keys.onEscapePressed: binding.dismiss()

    Connections {
        target: root.binding
        function onDismissed() { root.navigation.dismiss() }
    }

    SymbolButton {
        id: closeButton

        objectName: "closeButton"
        anchors.top: parent.top
        anchors.right: parent.right
        anchors.margins: Theme.grid
        symbol: "xmark"
        symbolSize: 30
        text: qsTr("Close")
        onClicked: root.binding.dismiss()
    }

    Text {
        id: heading

        objectName: "exportHeading"
        anchors.top: closeButton.bottom
        anchors.topMargin: 2 * Theme.grid
        x: Theme.margin
        width: parent.width - 2 * Theme.margin
        text: root.binding.heading
        font.pixelSize: Theme.section
        font.weight: Font.DemiBold
        color: Theme.title
        wrapMode: Text.Wrap
        maximumLineCount: 2
        elide: Text.ElideRight
    }

    Column {
        id: options

        anchors.top: heading.bottom
        anchors.topMargin: Theme.margin
        width: parent.width

        Repeater {
            model: root.binding.options

            T.AbstractButton {
                id: option

                required property int index
                required property string modelData

                objectName: "exportOption" + index
                width: options.width
                implicitHeight: Theme.touch + 3 * Theme.grid
                leftPadding: Theme.margin
                rightPadding: 3 * Theme.grid
                activeFocusOnTab: true
                focus: index === 0
                text: modelData
                Accessible.role: Accessible.Button
                Accessible.name: text
                onClicked: root.binding.didTapExportButton(index)
                Keys.onReturnPressed: clicked()
                Keys.onEnterPressed: clicked()

                background: RowBackground {
                    control: option
                    inset: 0

                    Separator {
                        visible: option.index === 0
                    }
                }
                contentItem: Item {
                    Text {
                        anchors.left: parent.left
                        anchors.verticalCenter: parent.verticalCenter
                        text: option.text
                        font.pixelSize: Theme.row
                        color: Theme.title
                    }
                    Symbol {
                        anchors.right: parent.right
                        anchors.verticalCenter: parent.verticalCenter
                        size: 16
                        symbol: "chevron.right"
                        color: Theme.header
                    }
                }
            }
        }
    }

    LoadingView {
        id: loading

        objectName: "exportLoading"
        anchors.top: options.bottom
        anchors.topMargin: 6 * Theme.grid
        anchors.horizontalCenter: parent.horizontalCenter
        visible: root.binding.isLoadingShown
        isAnimating: root.binding.isLoadingAnimating
        text: root.binding.loadingText
    }

    SaveTextSheet {}
}
