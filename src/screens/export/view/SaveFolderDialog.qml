import QtQuick
import QtQuick.Dialogs
import Quorl

// The desktop's own choice of a folder.
FolderDialog {
    signal closed

    currentFolder: SaveText.folderUrl
    onAccepted: {
        SaveText.chooseFolder(selectedFolder)
        closed()
    }
    onRejected: closed()
}
