import QtQuick
import Quorl

// One column of a ticker: its characters one under the other, of which the shown one is in the middle.
Item {
    id: column

    required property var characters
    required property real fontSize
    required property int shownRow

    readonly property real rowHeight: Math.round(48 * Theme.fontScale)
    readonly property alias isScrolling: movement.running

    height: rowHeight
    clip: true
    enabled: false
    Accessible.ignored: true

    Column {
        width: parent.width
        y: -column.shownRow * column.rowHeight

        Behavior on y {
            NumberAnimation {
                id: movement

                duration: Theme.duration(300)
                easing.type: Easing.InOutQuad
            }
        }
        Repeater {
            model: column.characters

            TickerCell {
                required property string modelData

                width: column.width
                height: column.rowHeight
                digit: modelData
                fontSize: column.fontSize
            }
        }
    }
}
