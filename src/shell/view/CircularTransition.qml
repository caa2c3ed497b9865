import QtQuick
import Quorl

// A circle that grows out of a point with the view that comes, and shrinks back into it with the one that goes. It
// fills the container; `view` is the one that moves: the outgoing one of a dismissal, the incoming one of the others.
Item {
    id: transition

    required property CircularTransitionBinding binding
    required property Item view

    // 0 at the circle's smallest, 1 when the view is in its place.
    property real progress: 0
    readonly property real viewScale: binding.smallestScale + (1 - binding.smallestScale) * progress

    signal finished

    function run(mode) {
        binding.mode = mode
        const end = mode === CircularTransitionBinding.Present ? 1 : 0
        animation.stop()
        if (Theme.reducedMotion) {
            progress = end
            finished()
            return
        }
        animation.from = 1 - end
        animation.to = end
        animation.start()
    }

    NumberAnimation {
        id: animation

        target: transition
        property: "progress"
        duration: transition.binding.durationMs
        easing.type: Easing.InOutQuad
        onFinished: transition.finished()
    }

    Rectangle {
        objectName: "transitionCircle"
        width: transition.binding.diameter
        height: width
        radius: width / 2
        x: transition.binding.startingPoint.x - width / 2
        y: transition.binding.startingPoint.y - height / 2
        scale: transition.viewScale
        visible: transition.progress > 0
        color: Theme.color(transition.binding.circleColor)
    }
    Binding {
        target: transition.binding
        property: "container"
        value: Qt.size(transition.width, transition.height)
    }
    Binding {
        target: transition.view
        property: "scale"
        value: transition.viewScale
    }
    Binding {
        target: transition.view
        property: "opacity"
        value: transition.progress
    }
    Binding {
        target: transition.view
        property: "x"
        value: (1 - transition.progress) * (transition.binding.startingPoint.x - transition.width / 2)
    }
    Binding {
        target: transition.view
        property: "y"
        value: (1 - transition.progress) * (transition.binding.startingPoint.y - transition.height / 2)
    }
}
