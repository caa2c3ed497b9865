import QtQuick
import QtQuick.Controls.impl
import Quorl

// One of the named symbols, such as "bookmark.fill", in a named colour.
IconImage {
    property string symbol
    property int size: 24

    source: symbol === "" ? "" : "icons/" + symbol + ".svg"
    sourceSize: Qt.size(size, size)
    width: size
    height: size
    color: Theme.buttonNormal
}
