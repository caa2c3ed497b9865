import QtQuick
import Quorl

// What a slider is set to, of which a part may be coloured.
Text {
    horizontalAlignment: Text.AlignRight
    textFormat: Text.StyledText
    elide: Text.ElideRight
    fontSizeMode: Text.HorizontalFit
    minimumPixelSize: Theme.caption
    font.pixelSize: Theme.section
    font.bold: true
    color: Theme.title
    Accessible.role: Accessible.StaticText
}
