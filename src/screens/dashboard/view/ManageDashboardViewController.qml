import QtQuick
import QtQuick.Controls.Basic
import Quorl

// Removes pins: a swipe, or the Delete key, takes a row away.
FocusScope {
    id: root

    required property ManageDashboardBinding binding
    property var navigation

    objectName: "ManageDashboardViewController"
    Component.onDestruction: binding.leave()
    Keys.onEscapePressed: binding.dismiss()

    Connections {
        target: root.binding
        function onDismissed() { root.navigation.dismiss() }
    }

    Item {
        id: bar

        width: parent.width
        height: Theme.touch + 2 * Theme.grid

        Text {
            anchors.left: parent.left
            anchors.leftMargin: Theme.margin
            anchors.right: closeButton.left
            anchors.verticalCenter: parent.verticalCenter
            text: qsTr("Manage Dashboard")
            font.pixelSize: Theme.section
            font.weight: Font.DemiBold
            color: Theme.title
            elide: Text.ElideRight
        }
        SymbolButton {
            id: closeButton

            objectName: "closeButton"
            anchors.right: parent.right
            anchors.rightMargin: Theme.grid
            anchors.verticalCenter: parent.verticalCenter
            symbol: "xmark"
            text: qsTr("Close")
            onClicked: root.binding.dismiss()
        }
    }

    Text {
        id: hint

        objectName: "swipeHint"
        anchors.top: bar.bottom
        anchors.left: parent.left
        anchors.leftMargin: Theme.margin
        visible: list.count > 0
        height: visible ? implicitHeight + 2 * Theme.grid : 0
        text: root.binding.hint
        font.pixelSize: Theme.caption
        color: Theme.header
    }

    Separator {
        id: line

        anchors.top: hint.bottom
    }

    ListView {
        id: list

        objectName: "managedList"
        anchors.top: line.bottom
        anchors.bottom: parent.bottom
        width: parent.width
        clip: true
        model: root.binding.rows
        activeFocusOnTab: true
        focus: true
        Accessible.role: Accessible.List
        Accessible.name: qsTr("Pinned attributes")

        delegate: SwipeDelegate {
            id: row

            required property int index
            required property string name
            required property string context
            readonly property bool isSwiped: swipe.position === -1 && !pressed

            objectName: "managedRow"
            width: ListView.view.width
            implicitHeight: Math.max(Theme.touch + Theme.grid, names.implicitHeight + 2 * Theme.grid)
            leftPadding: Theme.margin
            rightPadding: Theme.grid
            topPadding: 0
            bottomPadding: 0
            Accessible.role: Accessible.ListItem
            Accessible.name: name
            Accessible.description: context

            Keys.onDeletePressed: root.binding.swipeToDelete(index)
            Keys.onPressed: event => {
                if (event.key !== Qt.Key_Backspace)
                    return
                root.binding.swipeToDelete(index)
                event.accepted = true
            }

            contentItem: Item {
                Column {
                    id: names

                    anchors.left: parent.left
                    anchors.right: deleteButton.left
                    anchors.verticalCenter: parent.verticalCenter

                    Text {
                        width: parent.width
                        text: row.name
                        font.pixelSize: Theme.row
                        color: Theme.title
                        elide: Text.ElideMiddle
                        textFormat: Text.PlainText
                    }
                    Text {
                        width: parent.width
                        text: row.context
                        font.pixelSize: Theme.caption
                        color: Theme.header
                        elide: Text.ElideMiddle
                        textFormat: Text.PlainText
                    }
                }
                SymbolButton {
                    id: deleteButton

                    readonly property bool isUnderKeys: FocusRing.isShown && list.activeFocus && row.ListView.isCurrentItem

                    objectName: "deleteButton"
                    anchors.right: parent.right
                    anchors.verticalCenter: parent.verticalCenter
                    visible: row.hovered || isUnderKeys
                    focusPolicy: Qt.TabFocus
                    symbol: "trash"
                    text: qsTr("Delete %1").arg(row.name)
                    onClicked: root.binding.swipeToDelete(row.index)
                }
            }

            background: RowBackground {
                control: row
                color: row.down ? Theme.pressed : Theme.background
            }

            swipe.right: Rectangle {
                anchors.right: parent.right
                width: parent.width
                height: parent.height
                color: Theme.buttonSelected

                Row {
                    anchors.right: parent.right
                    anchors.rightMargin: Theme.margin
                    anchors.verticalCenter: parent.verticalCenter
                    spacing: 2 * Theme.grid

                    Symbol {
                        anchors.verticalCenter: parent.verticalCenter
                        symbol: "trash"
                        color: Theme.background
                    }
                    Text {
                        anchors.verticalCenter: parent.verticalCenter
                        text: qsTr("Delete")
                        font.pixelSize: Theme.value
                        font.weight: Font.DemiBold
                        color: Theme.background
                    }
                }
            }
            onIsSwipedChanged: {
                if (!isSwiped)
                    return
                root.binding.swipeToDelete(index)
                stillThere.restart()
            }
            // A row that could not be deleted goes back to its place.
            Delay {
                id: stillThere

                duration: 1000
                onFinished: row.swipe.close()
            }
            ListView.onRemove: stillThere.stop()
        }

        displaced: Transition {
            NumberAnimation { property: "y"; duration: Theme.duration(200); easing.type: Easing.OutCubic }
        }
    }

    EmptyState {
        objectName: "managedEmpty"
        anchors.centerIn: list
        isShown: list.count === 0
        title: qsTr("Nothing is pinned.")
        text: qsTr("The bookmark of an attribute in the detail of a metric pins it here.")
    }
}
