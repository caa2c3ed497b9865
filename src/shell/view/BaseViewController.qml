import QtQuick
import Quorl

// The container of the tabs' screens, under navigation bar, tab bar and carrier bar.
FocusScope {
    id: base

    required property ShellBinding shell
    required property Navigation navigation

    // The current tab's screen; null until it is there.
    readonly property Item screen: screens.count > 0 && screens.itemAt(shell.currentIndex)
                                   ? screens.itemAt(shell.currentIndex).item : null

    Rectangle {
        anchors.fill: parent
        color: Theme.background
    }
    NavigationBar {
        id: bar

        objectName: "rootBar"
        shell: base.shell
        width: parent.width
        title: base.shell.title
        prefersLargeTitle: base.shell.prefersLargeTitles
        flickable: base.screen && base.screen.flickable ? base.screen.flickable : null
        trailingWidth: exportButton.visible ? 30 + 2 * Theme.margin : 0
        trailing: SymbolButton {
            id: exportButton

            objectName: "exportButton"
            visible: base.shell.showsExportButton
            symbol: "square.and.arrow.up"
            text: qsTr("Export")
            // The icon is 16 from the right edge and 12 from the bottom; what takes the touch is larger.
            x: parent.width - 16 - 15 - width / 2
            y: parent.height - 12 - 15 - height / 2
            onClicked: base.shell.exportTapped()
            contentItem: Item {
                Symbol {
                    anchors.centerIn: parent
                    size: 30
                    symbol: exportButton.symbol
                    color: exportButton.tint
                }
            }
        }
    }
    MenuBar {
        id: menu

        objectName: "menuBar"
        anchors.top: bar.bottom
        width: parent.width
        binding: base.shell.menuBar
    }
    CarrierNameSegmentView {
        id: carriers

        objectName: "carrierBar"
        anchors.top: menu.bottom
        width: parent.width
        height: base.shell.carrierBarHeight
        binding: base.shell.carrierBar
    }
    Item {
        id: container

        objectName: "container"
        anchors.top: carriers.bottom
        anchors.bottom: parent.bottom
        width: parent.width

        Repeater {
            id: screens

            model: base.shell.screenNames

            // Made when its tab is first shown, and kept.
            Loader {
                required property int index
                required property string modelData

                readonly property bool isCurrent: base.shell.currentIndex === index

                function load() {
                    if (!isCurrent || status !== Loader.Null)
                        return
                    const binding = base.shell.screen(index)
                    if (binding)
                        setSource(modelData + ".qml", {binding: binding, navigation: base.navigation})
                }

                objectName: "tab" + index
                anchors.fill: parent
                visible: isCurrent
                focus: isCurrent
                onIsCurrentChanged: load()
                Component.onCompleted: load()
            }
        }
    }
}
