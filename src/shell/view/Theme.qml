pragma Singleton
import QtQuick
import Quorl

// The one place of colours, type sizes and distances.
QtObject {
    readonly property bool isDark: Appearance.isDark

    // The named colours.
    readonly property color background: isDark ? "#0E1217" : "#F7F8FA"
    readonly property color title: isDark ? "#F1F4F8" : "#11161D"
    readonly property color content: isDark ? "#C2CBD6" : "#3A4453"
    readonly property color header: isDark ? "#93A0B0" : "#566273"
    readonly property color buttonNormal: isDark ? "#778392" : "#7A8594"
    readonly property color buttonSelected: isDark ? "#FF9B45" : "#B63C0B"
    readonly property color subtitleNumbers: isDark ? "#67D4E6" : "#0B6478"

    // Surfaces are "Background" with a little "Title" in it.
    readonly property color bar: mixed(background, title, 0.04)
    readonly property color card: mixed(background, title, 0.06)
    readonly property color pressed: mixed(background, title, 0.08)
    // A plain line, and the veil under what is presented.
    readonly property color line: Qt.alpha(buttonNormal, 0.3)
    readonly property color veil: Qt.alpha(isDark ? background : title, 0.5)

    // The capsule of the chosen carrier is white in both palettes, so its text is dark in both.
    readonly property color capsule: "white"
    readonly property color capsuleText: isDark ? background : title

    readonly property real fontScale: Appearance.fontScale
    readonly property int largeTitle: Math.round(34 * fontScale)
    readonly property int section: Math.round(20 * fontScale)
    readonly property int row: Math.round(17 * fontScale)
    readonly property int value: Math.round(15 * fontScale)
    readonly property int caption: Math.round(13 * fontScale)

    readonly property int grid: 4
    readonly property int margin: 16
    readonly property int touch: 44
    // From this width on list and detail stand side by side.
    readonly property int wideWidth: 720

    readonly property bool reducedMotion: Appearance.reducedMotion

    // The named colour, as "ButtonSelected", or one that the toolkit knows, as "white".
    function color(name: string): color {
        return { Background: background, Title: title, Content: content, Header: header, ButtonNormal: buttonNormal,
                 ButtonSelected: buttonSelected, SubtitleNumbers: subtitleNumbers }[name] ?? name
    }

    // `ms` milliseconds, or none where the system asks for less motion.
    function duration(ms: int): int {
        return reducedMotion ? 0 : ms
    }

    function mixed(base: color, other: color, part: real): color {
        return Qt.tint(base, Qt.alpha(other, part))
    }
}
