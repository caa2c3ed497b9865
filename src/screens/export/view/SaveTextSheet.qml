import QtQuick
import QtQuick.Controls.Basic
import QtQuick.Templates as T
import Quorl

// Asks where a shared text is to be written.
Popup {
    id: sheet

    readonly property int stage: SaveText.stage
    readonly property bool asks: stage === SaveText.Asking

    objectName: "saveSheet"
    parent: T.Overlay.overlay
    anchors.centerIn: parent
    width: parent ? Math.min(480, parent.width - 2 * Theme.margin) : 0
    padding: Theme.margin
    modal: true
    focus: true
    closePolicy: Popup.NoAutoClose
    visible: stage !== SaveText.Closed
    onOpened: focusStage()
    onStageChanged: if (opened) Qt.callLater(focusStage)

    // Where the keyboard goes on: a field, or the button that does no harm.
    function focusStage() {
        if (asks)
            nameField.forceActiveFocus()
        else if (stage !== SaveText.Closed)
            cancelButton.forceActiveFocus()
    }

    T.Overlay.modal: Rectangle { color: Theme.veil }
    background: Rectangle {
        radius: 3 * Theme.grid
        color: Theme.background
        border.width: 1
        border.color: Theme.line
    }
    enter: Transition {
        NumberAnimation { property: "opacity"; from: 0; to: 1; duration: Theme.duration(150) }
    }

    component FieldLabel: Text {
        font.pixelSize: Theme.caption
        color: Theme.header
    }

    contentItem: Column {
        objectName: "saveSheetContent"
        spacing: 2 * Theme.grid
        Keys.onEscapePressed: sheet.stage === SaveText.Replacing ? SaveText.keep() : SaveText.close()

        Text {
            width: parent.width
            text: qsTr("Save export")
            font.pixelSize: Theme.section
            font.weight: Font.DemiBold
            color: Theme.title
        }
        FieldLabel {
            text: qsTr("Folder")
            visible: sheet.asks
        }
        Item {
            width: parent.width
            height: Theme.touch
            visible: sheet.asks

            Field {
                objectName: "folderField"
                width: parent.width - browseButton.width - Theme.grid
                text: SaveText.folder
                Accessible.name: qsTr("Folder")
                onTextEdited: SaveText.folder = text
                onAccepted: SaveText.save()
            }
            TextButton {
                id: browseButton

                objectName: "browseButton"
                anchors.right: parent.right
                text: qsTr("Browse…")
                onClicked: folderDialog.active = true
            }
        }
        FieldLabel {
            text: qsTr("File name")
            visible: sheet.asks
        }
        Field {
            id: nameField

            objectName: "fileNameField"
            width: parent.width
            visible: sheet.asks
            text: SaveText.fileName
            Accessible.name: qsTr("File name")
            onTextEdited: SaveText.fileName = text
            onAccepted: SaveText.save()
        }
        Text {
            objectName: "saveMessage"
            width: parent.width
            visible: text !== "" && sheet.stage !== SaveText.Writing
            text: SaveText.message
            font.pixelSize: Theme.value
            color: Theme.content
            wrapMode: Text.Wrap
            textFormat: Text.PlainText
            Accessible.role: Accessible.AlertMessage
            Accessible.name: text
        }
        LoadingView {
            visible: sheet.stage === SaveText.Writing
            isAnimating: visible
            text: visible ? SaveText.message : ""
        }
        Row {
            anchors.right: parent.right
            spacing: 2 * Theme.grid

            TextButton {
                id: cancelButton

                objectName: "cancelSaveButton"
                text: sheet.stage === SaveText.Replacing ? qsTr("Keep") : sheet.asks ? qsTr("Cancel") : qsTr("Done")
                onClicked: sheet.stage === SaveText.Replacing ? SaveText.keep() : SaveText.close()
            }
            TextButton {
                objectName: "saveButton"
                visible: sheet.asks
                isFilled: true
                text: qsTr("Save")
                onClicked: SaveText.save()
            }
            TextButton {
                objectName: "replaceButton"
                visible: sheet.stage === SaveText.Replacing
                isFilled: true
                text: qsTr("Replace")
                onClicked: SaveText.replace()
            }
        }
    }

    // Made when it is first asked for: a desktop's own dialog is not cheap.
    Loader {
        id: folderDialog

        active: false
        source: active ? "SaveFolderDialog.qml" : ""
        onLoaded: item.open()

        Connections {
            target: folderDialog.item
            function onClosed() { folderDialog.active = false }
        }
    }
}
