import QtQuick
import Quorl

// A thin line from side to side of what it stands in.
Rectangle {
    // What it leaves free on the left.
    property real inset: 0

    x: inset
    width: parent ? parent.width - inset : 0
    height: 1
    color: Theme.line
}
