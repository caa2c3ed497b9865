import QtQuick

// Runs for a time and moves nothing. By the clock of animations, which a test can step, and which stands still while
// nothing is drawn.
NumberAnimation {
    target: QtObject { property real passed: 0 }
    property: "passed"
    from: 0
    to: 1
}
