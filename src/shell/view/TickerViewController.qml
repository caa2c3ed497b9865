import QtQuick
import Quorl

// A number in the manner of a mechanical counter.
Item {
    id: ticker

    required property TickerColumnsModel model

    Accessible.role: Accessible.StaticText
    Accessible.name: model.stringValue

    Row {
        objectName: "tickerColumns"
        anchors.centerIn: parent

        Repeater {
            model: ticker.model

            TickerColumnCell {
                required property int index
                required property real columnWidth

                objectName: "tickerColumn"
                width: columnWidth
                onIsScrollingChanged: ticker.model.setScrolling(index, isScrolling)
            }
        }
    }
}
