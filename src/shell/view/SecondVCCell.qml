import QtQuick
import QtQuick.Templates as T
import Quorl

// A row of a list that leads on: a text on the left, another on the right, and a chevron.
T.AbstractButton {
    id: cell

    property bool metricFavorited: false
    property string leftText
    property string rightText
    property bool showsSeparator: true
    property real sinceReleaseMs: 550

    implicitWidth: 320
    implicitHeight: Math.max(Theme.touch, left.implicitHeight + 4 * Theme.grid)
    activeFocusOnTab: true
    text: leftText
    Accessible.role: Accessible.Button
    Accessible.name: [leftText, rightText].filter(text => text).join(", ")
    Accessible.onPressAction: cell.click()
    Keys.onReturnPressed: cell.click()
    Keys.onEnterPressed: cell.click()

    // Dims at once, and comes back in half a second after a short delay.
    opacity: down ? 0.5 : 0.5 + 0.5 * Math.max(0, sinceReleaseMs - 50) / 500
    onDownChanged: {
        if (down)
            comeBack.stop()
        else
            comeBack.restart()
    }

    NumberAnimation {
        id: comeBack

        target: cell
        property: "sinceReleaseMs"
        from: 0
        to: 550
        duration: Theme.duration(550)
    }

    background: Rectangle {
        color: cell.activeFocus && FocusRing.isShown ? Theme.card : "transparent"

        Separator {
            objectName: "separatorView"
            anchors.bottom: parent.bottom
            inset: Theme.margin
            visible: cell.showsSeparator
        }
    }
    contentItem: Item {
        Symbol {
            id: bookmark

            anchors.left: parent.left
            anchors.leftMargin: Theme.margin
            anchors.verticalCenter: parent.verticalCenter
            visible: cell.metricFavorited
            symbol: "bookmark.fill"
            size: 16
            color: Theme.buttonSelected
        }
        Text {
            id: left

            objectName: "leftLabel"
            anchors.left: bookmark.visible ? bookmark.right : parent.left
            anchors.leftMargin: bookmark.visible ? 2 * Theme.grid : Theme.margin
            anchors.right: right.left
            anchors.rightMargin: 2 * Theme.grid
            anchors.verticalCenter: parent.verticalCenter
            text: cell.leftText
            textFormat: Text.PlainText
            elide: Text.ElideMiddle
            font.pixelSize: Theme.row
            color: Theme.title
        }
        Text {
            id: right

            objectName: "rightLabel"
            anchors.right: chevron.left
            anchors.rightMargin: Theme.grid
            anchors.verticalCenter: parent.verticalCenter
            width: Math.min(implicitWidth, cell.width / 2)
            text: cell.rightText
            textFormat: Text.PlainText
            elide: Text.ElideRight
            font.pixelSize: Theme.value
            color: Theme.subtitleNumbers
        }
        Symbol {
            id: chevron

            anchors.right: parent.right
            anchors.rightMargin: Theme.margin
            anchors.verticalCenter: parent.verticalCenter
            symbol: "chevron.right"
            size: 20
            color: Theme.header
        }
    }
}
