import QtQuick
import QtQuick.Controls.Basic
import QtQuick.Templates as T
import Quorl

// A dialog of the product: a title, a message and one button, over everything else.
Popup {
    id: dialog

    required property AlertsBinding alerts

    objectName: "alertDialog"
    parent: T.Overlay.overlay
    anchors.centerIn: parent
    width: Math.min(parent ? parent.width - 2 * Theme.margin : 320, 320)
    padding: Theme.margin
    modal: true
    focus: true
    closePolicy: Popup.NoAutoClose
    visible: alerts.isShowing
    T.Overlay.modal: Rectangle {
        color: Theme.veil
    }

    background: Rectangle {
        radius: Theme.margin
        color: Theme.bar
        border.width: 1
        border.color: Theme.line
    }
    contentItem: Column {
        spacing: Theme.grid * 2
        Accessible.role: Accessible.AlertMessage
        Accessible.name: dialog.alerts.title
        Accessible.description: dialog.alerts.message

        Text {
            objectName: "alertTitle"
            width: parent.width
            text: dialog.alerts.title
            textFormat: Text.PlainText
            wrapMode: Text.Wrap
            horizontalAlignment: Text.AlignHCenter
            font.pixelSize: Theme.row
            font.bold: true
            color: Theme.title
        }
        Text {
            objectName: "alertMessage"
            width: parent.width
            visible: text
            text: dialog.alerts.message
            textFormat: Text.PlainText
            wrapMode: Text.Wrap
            horizontalAlignment: Text.AlignHCenter
            font.pixelSize: Theme.value
            color: Theme.content
        }
        PlainButton {
            objectName: "alertButton"
            width: parent.width
            height: Theme.touch
            focus: true
            text: dialog.alerts.button
            onClicked: dialog.alerts.press()
            contentItem: Text {
                text: dialog.alerts.button
                textFormat: Text.PlainText
                font.pixelSize: Theme.row
                font.weight: Font.DemiBold
                color: Theme.buttonSelected
                horizontalAlignment: Text.AlignHCenter
                verticalAlignment: Text.AlignVCenter
            }
        }
    }
}
