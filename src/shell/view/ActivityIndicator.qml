import QtQuick
import Quorl

// A turning wheel of spokes.
Item {
    id: indicator

    enum Style { Medium, Large }

    property bool isAnimating: false
    property int style: ActivityIndicator.Medium
    property color color: Theme.header

    readonly property int spokeCount: 8

    implicitWidth: style === ActivityIndicator.Large ? 36 : 20
    implicitHeight: implicitWidth
    Accessible.role: Accessible.ProgressBar
    Accessible.name: qsTr("Loading")

    Item {
        id: wheel

        anchors.fill: parent

        Repeater {
            model: indicator.spokeCount

            Item {
                id: spoke

                required property int index

                anchors.fill: parent
                rotation: index * 360 / indicator.spokeCount
                opacity: 0.15 + 0.85 * index / (indicator.spokeCount - 1)

                Rectangle {
                    anchors.horizontalCenter: parent.horizontalCenter
                    width: spoke.width * 0.11
                    height: spoke.height * 0.3
                    radius: width / 2
                    color: indicator.color
                }
            }
        }
        RotationAnimation on rotation {
            running: indicator.isAnimating && indicator.visible && !Theme.reducedMotion
            from: 0
            to: 360
            duration: 900
            loops: Animation.Infinite
        }
    }
}
