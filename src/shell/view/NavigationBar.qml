import QtQuick
import Quorl

// The bar over a screen: its title, large until the screen's list is scrolled, a way back, and room for buttons.
Rectangle {
    id: bar

    required property ShellBinding shell
    property string title
    // The title while it is large, where a screen says more in it.
    property string longTitle: title
    property bool showsBack: false
    property bool prefersLargeTitle: true
    // The screen's list, if it has one.
    property Flickable flickable: null
    // What stands at the right edge.
    property alias trailing: trailing.data
    property real trailingWidth: 0

    readonly property int smallHeight: Math.max(Theme.touch, Math.round(Theme.row * 1.4))
    readonly property int largeHeight: prefersLargeTitle ? Math.round(Theme.largeTitle * 1.5) : 0
    property bool isCollapsed: !prefersLargeTitle
    // How much of the large title has gone.
    property real collapse: isCollapsed ? 1 : 0

    signal backPressed

    function follow() {
        // Rows stay under the finger; the title follows when it has left.
        if (!prefersLargeTitle || !flickable || flickable.dragging)
            return
        isCollapsed = shell.isLargeTitleCollapsed(isCollapsed, flickable.contentY - flickable.originY,
                                                  flickable.contentHeight, flickable.height, largeHeight)
    }

    implicitHeight: smallHeight + largeHeight * (1 - collapse)
    color: Theme.background
    clip: true
    onFlickableChanged: flickable ? follow() : isCollapsed = !prefersLargeTitle

    Behavior on collapse {
        NumberAnimation {
            duration: Theme.duration(200)
            easing.type: Easing.OutCubic
        }
    }
    Connections {
        target: bar.flickable
        function onContentYChanged() { bar.follow() }
        function onDraggingChanged() { bar.follow() }
    }

    SymbolButton {
        id: back

        objectName: "backButton"
        visible: bar.showsBack
        width: visible ? implicitWidth : 0
        height: bar.smallHeight
        symbol: "chevron.left"
        text: qsTr("Back")
        onClicked: bar.backPressed()
    }
    Text {
        objectName: "barTitle"
        visible: opacity > 0
        opacity: bar.prefersLargeTitle ? Math.max(0, 2 * bar.collapse - 1) : 1
        anchors.left: parent.left
        anchors.right: parent.right
        anchors.leftMargin: Math.max(Theme.margin, back.width, bar.trailingWidth)
        anchors.rightMargin: anchors.leftMargin
        height: bar.smallHeight
        text: bar.title
        textFormat: Text.PlainText
        font.pixelSize: Theme.row
        font.weight: Font.DemiBold
        color: Theme.title
        elide: Text.ElideMiddle
        horizontalAlignment: Text.AlignHCenter
        verticalAlignment: Text.AlignVCenter
        Accessible.ignored: true
    }
    Text {
        objectName: "largeTitle"
        visible: bar.prefersLargeTitle && opacity > 0
        opacity: Math.max(0, 1 - 2 * bar.collapse)
        y: bar.implicitHeight - height
        x: Theme.margin
        width: parent.width - Theme.margin - Math.max(Theme.margin, bar.trailingWidth)
        height: bar.largeHeight
        text: bar.longTitle
        textFormat: Text.PlainText
        font.pixelSize: Theme.largeTitle
        font.bold: true
        fontSizeMode: Text.HorizontalFit
        minimumPixelSize: Theme.section
        color: Theme.title
        elide: Text.ElideMiddle
        verticalAlignment: Text.AlignVCenter
        Accessible.role: Accessible.Heading
        Accessible.name: bar.longTitle
    }
    Item {
        id: trailing

        anchors.fill: parent
    }
    Separator {
        anchors.bottom: parent.bottom
        opacity: bar.showsBack ? bar.collapse : 0
    }
}
