import QtQuick
import QtQuick.Templates as T
import Quorl

// An attribute with its value: a long press, Enter, Space or Ctrl+C copies the value. A changed value is tinted for a
// moment. Items put into it stand behind the value.
T.AbstractButton {
    id: row

    property string name
    property string context
    property string value
    property var trace: []
    // Whether a long value takes several lines.
    property bool wraps: false
    default property alias trailing: trailingItems.data
    // The first value is not a change.
    property bool isReady: false

    signal copyRequested

    implicitHeight: Math.max(Theme.touch + Theme.grid, names.implicitHeight + 2 * Theme.grid,
                             valueText.implicitHeight + 4 * Theme.grid)
    leftPadding: Theme.margin
    rightPadding: trailingItems.width > 0 ? Theme.grid : Theme.margin
    Accessible.role: Accessible.ListItem
    Accessible.name: name + ", " + value
    Accessible.description: context
    Accessible.focusable: true

    onPressAndHold: copyRequested()
    Keys.onReturnPressed: copyRequested()
    Keys.onEnterPressed: copyRequested()
    Keys.onSpacePressed: copyRequested()
    Keys.onPressed: event => {
        if (!event.matches(StandardKey.Copy))
            return
        copyRequested()
        event.accepted = true
    }

    onValueChanged: if (isReady && !Theme.reducedMotion) fade.restart()
    Component.onCompleted: isReady = true

    background: RowBackground {
        control: row
    }

    contentItem: Item {
        id: content

        readonly property real room: width - trailingItems.width - 2 * Theme.grid
        readonly property bool showsTrace: row.trace.length > 1 && room > 260
        readonly property real valueRoom: room - (showsTrace ? traceLine.width + 2 * Theme.grid : 0)

        FontMetrics {
            id: nameMetrics

            font.pixelSize: Theme.row
        }
        FontMetrics {
            id: contextMetrics

            font.pixelSize: Theme.caption
        }
        Column {
            id: names

            anchors.left: parent.left
            anchors.verticalCenter: parent.verticalCenter
            // What the value leaves; beside a long value what the names need, up to two fifths.
            width: {
                const left = content.valueRoom - valueText.naturalWidth - 3 * Theme.grid
                const most = 0.42 * content.valueRoom
                return left >= most ? left : Math.max(left, Math.min(most, needed()))
            }

            function needed(): real {
                return Math.ceil(Math.max(nameMetrics.advanceWidth(row.name), contextMetrics.advanceWidth(row.context)))
            }

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
                visible: text !== ""
                text: row.context
                font.pixelSize: Theme.caption
                color: Theme.header
                elide: Text.ElideMiddle
                textFormat: Text.PlainText
            }
        }

        TraceLine {
            id: traceLine

            visible: content.showsTrace
            anchors.right: valueText.left
            anchors.rightMargin: 2 * Theme.grid
            anchors.verticalCenter: parent.verticalCenter
            width: 64
            height: 24
            heights: row.trace
            color: Theme.buttonNormal
        }

        Rectangle {
            objectName: "changeTint"
            anchors.fill: valueText
            anchors.margins: -Theme.grid
            radius: Theme.grid
            color: Theme.buttonSelected
            opacity: 0

            NumberAnimation on opacity {
                id: fade

                running: false
                from: 0.25
                to: 0
                duration: 600
            }
        }

        ValueText {
            id: valueText

            anchors.right: trailingItems.left
            anchors.rightMargin: trailingItems.width > 0 ? 2 * Theme.grid : 0
            anchors.verticalCenter: parent.verticalCenter
            width: Math.min(naturalWidth, content.valueRoom - names.width - 3 * Theme.grid)
            text: row.value
            wraps: row.wraps
        }

        Row {
            id: trailingItems

            anchors.right: parent.right
            anchors.verticalCenter: parent.verticalCenter
        }
    }
}
