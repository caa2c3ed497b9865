import QtQuick
import Quorl

// A pushed screen under its bar. It comes in from the right and leaves that way.
FocusScope {
    id: page

    required property ShellBinding shell
    required property Item screen
    // How much of its width it stands to the right.
    property real offset: 0
    property bool isLeaving: false

    signal backPressed
    signal gone

    function enter(animated: bool) {
        if (animated && Theme.duration(1) > 0)
            entering.start()
    }
    function leave(animated: bool) {
        isLeaving = true
        if (animated && Theme.duration(1) > 0)
            leaving.start()
        else
            gone()
    }

    x: offset * width
    enabled: !isLeaving

    NumberAnimation on offset {
        id: entering
        running: false
        from: 1
        to: 0
        duration: 300
        easing.type: Easing.OutCubic
    }
    NumberAnimation on offset {
        id: leaving
        running: false
        to: 1
        duration: 250
        easing.type: Easing.InCubic
        onFinished: page.gone()
    }

    Rectangle {
        anchors.fill: parent
        color: Theme.background
    }
    // What lies under the page is not pressed through it.
    MouseArea {
        anchors.fill: parent
    }
    NavigationBar {
        id: bar

        objectName: "pageBar"
        shell: page.shell
        width: parent.width
        title: page.screen && page.screen.title !== undefined ? page.screen.title : ""
        longTitle: page.screen && page.screen.longTitle !== undefined ? page.screen.longTitle : title
        flickable: page.screen && page.screen.flickable ? page.screen.flickable : null
        showsBack: true
        onBackPressed: page.backPressed()
    }
    Item {
        id: content

        anchors.top: bar.bottom
        anchors.bottom: parent.bottom
        width: parent.width
    }
    Component.onCompleted: {
        screen.parent = content
        screen.anchors.fill = content
        screen.focus = true
        forceActiveFocus()
    }
    Component.onDestruction: screen.destroy()
}
