import QtQuick
import QtQuick.Controls.Basic
import Quorl

// A list of names, one of which can be chosen, and a cross.
FocusScope {
    id: modal

    required property MultiChoiceSelectionModalBinding binding

    Accessible.role: Accessible.Dialog
    Accessible.name: qsTr("Choose")

    Rectangle {
        anchors.fill: parent
        color: Theme.background
    }
    SymbolButton {
        id: cross

        objectName: "choiceDismissButton"
        anchors.right: parent.right
        // The cross is 15 from the edge; what takes the touch is larger.
        anchors.rightMargin: 15 - (width - 24) / 2
        anchors.top: parent.top
        symbol: "xmark"
        tint: Theme.buttonSelected
        text: qsTr("Close")
        onClicked: modal.binding.dismiss()
    }
    ListView {
        id: list

        objectName: "choiceList"
        anchors.top: cross.bottom
        anchors.bottom: parent.bottom
        width: parent.width
        clip: true
        focus: true
        activeFocusOnTab: true
        model: modal.binding.names
        Accessible.role: Accessible.List
        Accessible.name: qsTr("Choices")
        Keys.onReturnPressed: modal.binding.selectRow(currentIndex)
        Keys.onEnterPressed: modal.binding.selectRow(currentIndex)
        Keys.onSpacePressed: modal.binding.selectRow(currentIndex)

        delegate: ItemDelegate {
            id: row

            required property int index
            required property string modelData

            objectName: "choiceRow"
            width: list.width
            height: 75
            leftPadding: Theme.margin
            rightPadding: Theme.margin
            text: modelData
            focusPolicy: Qt.NoFocus
            Accessible.name: modelData
            onClicked: modal.binding.selectRow(index)

            background: Rectangle {
                color: row.down ? Theme.pressed : row.ListView.isCurrentItem && list.activeFocus ? Theme.card : Theme.background

                Separator {
                    anchors.bottom: parent.bottom
                    inset: Theme.margin
                }
            }
            contentItem: Text {
                objectName: "choiceRowText"
                text: row.modelData
                textFormat: Text.PlainText
                elide: Text.ElideRight
                verticalAlignment: Text.AlignVCenter
                font.pixelSize: Theme.row
                color: Theme.title
            }
        }
        ScrollIndicator.vertical: ScrollIndicator {}
    }
    Text {
        objectName: "choiceEmpty"
        anchors.centerIn: list
        width: parent.width - 2 * Theme.margin
        visible: list.count === 0
        text: qsTr("There is nothing to choose from.")
        wrapMode: Text.Wrap
        horizontalAlignment: Text.AlignHCenter
        font.pixelSize: Theme.value
        color: Theme.header
    }
}
