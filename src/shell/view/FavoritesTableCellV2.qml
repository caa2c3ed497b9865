import QtQuick
import Quorl

// A row with three texts, a spinner and a separator: the first text over the two others.
Item {
    id: cell

    property string titleText
    property string subtitleText
    property string valueText
    property bool showsActivityIndicator: false
    property bool showsSeparator: true
    property real inset: Theme.margin

    implicitHeight: Math.max(60, texts.implicitHeight + 3 * Theme.grid)
    Accessible.role: Accessible.ListItem
    Accessible.name: [titleText, subtitleText, valueText].filter(text => text).join(", ")

    Column {
        id: texts

        anchors.left: parent.left
        anchors.right: spinner.visible ? spinner.left : parent.right
        anchors.leftMargin: cell.inset
        anchors.rightMargin: cell.inset
        anchors.verticalCenter: parent.verticalCenter
        spacing: Theme.grid

        Text {
            objectName: "titleLabel"
            width: parent.width
            text: cell.titleText
            textFormat: Text.PlainText
            elide: Text.ElideMiddle
            font.pixelSize: Theme.value
            font.weight: Font.Medium
            color: Theme.title
            Accessible.ignored: true
        }
        Item {
            id: below

            // Side by side where there is room, else one under the other.
            readonly property bool isNarrow: subtitle.implicitWidth + value.implicitWidth + 2 * Theme.grid > width

            width: parent.width
            height: isNarrow ? subtitle.height + value.height : Math.max(subtitle.height, value.height)

            Text {
                id: subtitle

                objectName: "subtitleLabel"
                width: below.isNarrow ? parent.width : parent.width - value.width - 2 * Theme.grid
                text: cell.subtitleText
                textFormat: Text.PlainText
                elide: Text.ElideRight
                font.pixelSize: Theme.caption
                color: Theme.header
                Accessible.ignored: true
            }
            Text {
                id: value

                objectName: "valueLabel"
                anchors.right: parent.right
                y: below.isNarrow ? subtitle.height : 0
                width: Math.min(implicitWidth, parent.width)
                text: cell.valueText
                textFormat: Text.PlainText
                elide: Text.ElideRight
                horizontalAlignment: Text.AlignRight
                font.pixelSize: Theme.caption
                color: Theme.subtitleNumbers
                Accessible.ignored: true
            }
        }
    }
    ActivityIndicator {
        id: spinner

        anchors.right: parent.right
        anchors.rightMargin: cell.inset
        anchors.verticalCenter: parent.verticalCenter
        visible: cell.showsActivityIndicator
        isAnimating: visible
    }
    Separator {
        objectName: "separatorView"
        anchors.bottom: parent.bottom
        inset: cell.inset
        visible: cell.showsSeparator
    }
}
