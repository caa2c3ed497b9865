import QtQuick
import Quorl

// The pinned attributes with their latest values.
FocusScope {
    id: root

    required property DashboardBinding binding
    property var navigation
    readonly property Flickable flickable: list

    objectName: "DashboardViewController"

    Component {
        id: managingScreen

        ManageDashboardViewController {}
    }

    Connections {
        target: root.binding
        function onOpenManaging(screen) {
            root.navigation.present(managingScreen, { binding: screen, navigation: root.navigation })
        }
    }

    RefreshedLine {
        id: refreshedLine

        anchors.top: parent.top
        width: parent.width
        text: root.binding.lastRefreshedText
    }

    Item {
        id: header

        anchors.top: refreshedLine.bottom
        width: parent.width
        height: Theme.touch

        Text {
            anchors.left: parent.left
            anchors.leftMargin: Theme.margin
            anchors.right: manageButton.left
            anchors.verticalCenter: parent.verticalCenter
            text: list.count === 1 ? qsTr("1 attribute") : qsTr("%1 attributes").arg(list.count)
            visible: list.count > 0
            font.pixelSize: Theme.value
            font.weight: Font.DemiBold
            color: Theme.header
            elide: Text.ElideRight
        }
        TextButton {
            id: manageButton

            objectName: "manageButton"
            anchors.right: parent.right
            anchors.rightMargin: Theme.grid
            text: root.binding.manageControlText
            onClicked: root.binding.manageDashboardTapped()
        }
        Separator {
            anchors.bottom: parent.bottom
        }
    }

    // Side by side as far as a row stays easy to follow.
    GridView {
        id: list

        readonly property int columns: Math.max(1, Math.floor(width / 400))

        objectName: "dashboardList"
        anchors.top: header.bottom
        anchors.bottom: parent.bottom
        width: parent.width
        cellWidth: width / columns
        cellHeight: rowHeight.height
        clip: true
        model: root.binding.rows
        activeFocusOnTab: true
        focus: true
        boundsBehavior: Flickable.DragAndOvershootBounds
        Accessible.role: Accessible.List
        Accessible.name: qsTr("Dashboard")

        delegate: AttributeRow {
            required property int index

            required name
            required context
            required value
            required trace
            objectName: "dashboardRow"
            width: GridView.view.cellWidth
            height: GridView.view.cellHeight
            onCopyRequested: root.binding.longPress(index)
        }

        remove: Transition {
            NumberAnimation { property: "opacity"; to: 0; duration: Theme.duration(200) }
        }
        displaced: Transition {
            NumberAnimation { properties: "x,y"; duration: Theme.duration(200); easing.type: Easing.OutCubic }
        }
    }

    AttributeRow {
        id: rowHeight

        visible: false
        enabled: false
        height: implicitHeight
        name: "0"
        context: "0"
        value: "0"
    }

    EmptyState {
        objectName: "dashboardEmpty"
        anchors.centerIn: list
        isShown: list.count === 0
        title: qsTr("No readings yet.")
        text: qsTr("Metrics appear when the baseband sends them.")
    }

    Toast {
        anchors.fill: parent
        isShowing: root.binding.isToastShowing
        text: root.binding.toastText
    }
}
