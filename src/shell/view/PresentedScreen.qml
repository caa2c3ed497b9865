import QtQuick
import Quorl

// A screen over the whole window, or a sheet in the middle of a wide one.
FocusScope {
    id: sheet

    required property Item screen
    // 0 while it is out of sight below, 1 when it is in place.
    property real presence: 1
    property bool isLeaving: false

    readonly property bool isSheet: width >= Theme.wideWidth
    // A screen that is done in less says so.
    readonly property real sheetHeight: screen.sheetHeight === undefined ? 760
                                                                         : screen.sheetHeight + 2 * place.anchors.margins

    signal gone

    function enter() {
        if (Theme.duration(1) > 0)
            entering.start()
    }
    function leave() {
        isLeaving = true
        if (Theme.duration(1) > 0)
            leaving.start()
        else
            gone()
    }

    anchors.fill: parent
    enabled: !isLeaving
    Accessible.role: Accessible.Dialog

    NumberAnimation on presence {
        id: entering
        running: false
        from: 0
        to: 1
        duration: 300
        easing.type: Easing.OutCubic
    }
    NumberAnimation on presence {
        id: leaving
        running: false
        to: 0
        duration: 250
        easing.type: Easing.InCubic
        onFinished: sheet.gone()
    }

    Rectangle {
        anchors.fill: parent
        color: Theme.veil
        opacity: sheet.presence
    }
    MouseArea {
        anchors.fill: parent
        hoverEnabled: true
        onWheel: wheel => wheel.accepted = true
    }
    Rectangle {
        width: sheet.isSheet ? Math.min(sheet.width - 4 * Theme.margin, 640) : sheet.width
        height: sheet.isSheet ? Math.min(sheet.height - 4 * Theme.margin, sheet.sheetHeight) : sheet.height
        x: (sheet.width - width) / 2
        y: (sheet.height - height) / 2 + (1 - sheet.presence) * (sheet.height + height) / 2
        radius: sheet.isSheet ? Theme.margin : 0
        color: Theme.background
        border.width: sheet.isSheet ? 1 : 0
        border.color: Theme.line

        Item {
            id: place

            anchors.fill: parent
            anchors.margins: sheet.isSheet ? Theme.grid * 2 : 0
            clip: sheet.isSheet
        }
    }
    Component.onCompleted: {
        screen.parent = place
        screen.anchors.fill = place
        screen.focus = true
        forceActiveFocus()
    }
    Component.onDestruction: screen.destroy()
}
