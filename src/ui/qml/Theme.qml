pragma Singleton

import QtQuick
import Qelwatch.Ui

// Colours, sizes and times of the whole window; nothing else names a colour.
QtObject {
    readonly property bool dark: Appearance.dark

    readonly property color page: dark ? "#0D1013" : "#F3F4F6"
    readonly property color row: dark ? "#171B20" : "#FFFFFF"
    readonly property color value: dark ? "#F2F5F7" : "#12161A"
    readonly property color secondary: dark ? "#AEB8C2" : "#4A5560"
    readonly property color separator: dark ? "#2A3038" : "#DDE1E6"
    readonly property color accent: dark ? "#5CD6CB" : "#005F5B"
    readonly property color noticeGround: dark ? "#3A2C05" : "#FFF4D6"
    readonly property color noticeText: dark ? "#FFD98A" : "#5C3D00"
    readonly property color error: dark ? "#FF9A9A" : "#A3121F"

    // How good a level is; never without the word.
    readonly property color good: dark ? "#5FD39A" : "#006B3C"
    readonly property color fair: dark ? "#F0C75E" : "#7A5B00"
    readonly property color poor: dark ? "#FF9A9A" : "#A3121F"

    // Over what lies behind something that asks for all attention.
    readonly property color shade: Qt.alpha("#000000", 0.45)
    // The accent laid thinly over a row.
    readonly property color pressTint: Qt.alpha(accent, 0.12)

    // Points, so that they follow the screen's resolution and the user's text size.
    readonly property real titleSize: 15 * Appearance.textScale
    readonly property real valueSize: 12.75 * Appearance.textScale
    readonly property real nameSize: 10.5 * Appearance.textScale
    readonly property real headerSize: 9.75 * Appearance.textScale
    readonly property real axisSize: 8.25 * Appearance.textScale
    // Read from an arm's length.
    readonly property real figureSize: 34 * Appearance.textScale
    readonly property string fixedFamily: Appearance.fixedFamily

    readonly property int margin: 16
    readonly property int padding: 12
    readonly property int touch: 48
    // Lines longer than that are hard to follow on a desktop.
    readonly property int contentWidth: 640
    readonly property int hairline: 1
    readonly property real chartHeight: Math.round(166 * Appearance.textScale)

    readonly property int pressMs: 80
    // A second tap so soon after a screen came was meant for the screen before.
    readonly property int guardMs: Appearance.reducedMotion ? 0 : 300
    readonly property int slideMs: Appearance.reducedMotion ? 0 : 200
    readonly property int changeMs: Appearance.reducedMotion || !Appearance.seen ? 0 : 600

    // From the left edge of something so wide to where its content begins, and to where it ends.
    function inset(width: real): real {
        return margin + Math.max(0, Math.round((width - contentWidth) / 2));
    }

    function qualityColor(grade: string): color {
        return grade === "good" ? good : grade === "fair" ? fair : grade === "poor" ? poor : secondary;
    }

    // A long name may break after each of its underscores.
    function breakable(text: string): string {
        return text.replace(/_/g, "_\u200B");
    }
}
