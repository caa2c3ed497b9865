import QtQuick
import QtQuick.Controls.Basic
import QtQuick.Templates as T
import Quorl

// The choice of a configuration, over the whole window, under a circle that grows out of `origin`.
Popup {
    id: choice

    required property SondrelBinding binding
    required property Item origin

    function leave() {
        if (transition.binding.mode === CircularTransitionBinding.Dismiss)
            return
        transition.run(CircularTransitionBinding.Dismiss)
    }

    parent: T.Overlay.overlay
    width: parent ? parent.width : 0
    height: parent ? parent.height : 0
    padding: 0
    modal: true
    focus: true
    dim: false
    closePolicy: Popup.NoAutoClose
    background: null

    contentItem: FocusScope {
        focus: true
        Keys.onEscapePressed: loader.item.binding.dismiss()
        Keys.onBackPressed: loader.item.binding.dismiss()
        // Before the window's own use of the key.
        Keys.onShortcutOverride: event => event.accepted = event.key === Qt.Key_Escape

        CircularTransition {
            id: transition

            anchors.fill: parent
            binding: choice.binding.transition
            view: view
            onFinished: {
                if (binding.mode === CircularTransitionBinding.Dismiss) {
                    choice.close()
                    choice.binding.choiceDidClose()
                }
            }
        }
        Item {
            id: view

            width: transition.width
            height: transition.height

            Loader {
                id: loader

                anchors.fill: parent
                focus: true
            }
        }
    }

    Connections {
        target: choice.binding
        function onChoiceChanged() {
            if (!choice.binding.choice) {
                loader.source = ""
                return
            }
            const middle = choice.origin.mapToItem(null, choice.origin.width / 2, choice.origin.height / 2)
            choice.binding.transition.startingPoint = middle
            loader.setSource("MultiChoiceSelectionModal.qml", {binding: choice.binding.choice})
            choice.open()
            transition.run(CircularTransitionBinding.Present)
            loader.item.forceActiveFocus()
        }
    }
    Connections {
        target: choice.binding.choice
        function onDismissed() { choice.leave() }
    }
}
