import QtQuick
import QtQuick.Controls.Basic
import Quorl

ApplicationWindow {
    id: window

    required property ShellBinding shell

    objectName: "appWindow"
    title: "Quorl"
    width: 390
    height: 844
    minimumWidth: 320
    minimumHeight: 480
    visible: true
    color: Theme.background
    palette {
        window: Theme.background
        windowText: Theme.title
        base: Theme.background
        text: Theme.title
        button: Theme.card
        buttonText: Theme.title
        highlight: Theme.buttonSelected
        highlightedText: Theme.background
        placeholderText: Theme.header
    }

    RootNavigationController {
        id: root

        objectName: "rootNavigation"
        anchors.fill: parent
        focus: true
        shell: window.shell
    }
    AlertDialog {
        alerts: window.shell.alerts
    }

    Shortcut {
        sequences: ["Escape", StandardKey.Back]
        enabled: !window.shell.alerts.isShowing && root.canGoBack
        onActivated: root.goBack()
    }
    Repeater {
        model: window.shell.menuBar.count

        Item {
            required property int index

            Shortcut {
                sequence: "Ctrl+" + (index + 1)
                enabled: !window.shell.alerts.isShowing
                onActivated: root.selectTab(index)
            }
        }
    }
}
