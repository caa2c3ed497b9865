import QtQuick
import QtQuick.Controls.Basic
import Quorl

// A grid of band rows under one header.
FocusScope {
    id: root

    required property BandCellsModel model
    readonly property Flickable flickable: grid

    Rectangle {
        anchors.fill: parent
        color: Theme.background
    }
    GridView {
        id: grid

        readonly property int columns: Math.max(1, Math.floor((width - Theme.margin) / 160))

        objectName: "bandGrid"
        anchors.fill: parent
        anchors.leftMargin: Theme.margin / 2
        anchors.rightMargin: Theme.margin / 2
        activeFocusOnTab: true
        clip: true
        cellWidth: Math.floor(width / columns)
        cellHeight: Math.max(64, Theme.row * 2 + Theme.caption + 4 * Theme.grid)
        model: root.model
        header: Text {
            objectName: "bandSectionTitle"
            width: grid.width
            leftPadding: Theme.margin / 2
            topPadding: 2 * Theme.grid
            bottomPadding: 2 * Theme.grid
            text: root.model.sectionTitle
            textFormat: Text.PlainText
            elide: Text.ElideRight
            font.pixelSize: Theme.section
            font.bold: true
            color: Theme.header
        }
        delegate: Item {
            id: cell

            required property string mainText
            required property string secondText
            required property bool isSecondTextHidden

            objectName: "bandCell"
            width: grid.cellWidth
            height: grid.cellHeight
            Accessible.role: Accessible.Cell
            Accessible.name: mainText

            Rectangle {
                anchors.fill: parent
                anchors.margins: Theme.grid
                radius: 2 * Theme.grid
                color: Theme.card
                border.width: cell.GridView.isCurrentItem && grid.activeFocus ? 2 : 0
                border.color: Theme.buttonSelected

                Column {
                    anchors.centerIn: parent
                    width: parent.width - 4 * Theme.grid
                    spacing: Theme.grid

                    Text {
                        objectName: "bandMainText"
                        width: parent.width
                        text: cell.mainText
                        textFormat: Text.PlainText
                        elide: Text.ElideMiddle
                        horizontalAlignment: Text.AlignHCenter
                        font.pixelSize: Theme.row
                        font.weight: Font.Medium
                        color: Theme.subtitleNumbers
                    }
                    Text {
                        objectName: "bandSecondText"
                        width: parent.width
                        visible: !cell.isSecondTextHidden
                        text: cell.secondText
                        textFormat: Text.PlainText
                        elide: Text.ElideRight
                        horizontalAlignment: Text.AlignHCenter
                        font.pixelSize: Theme.caption
                        color: Theme.header
                    }
                }
            }
        }
        Accessible.role: Accessible.Table
        Accessible.name: root.model.sectionTitle
        ScrollIndicator.vertical: ScrollIndicator {}
    }
}
