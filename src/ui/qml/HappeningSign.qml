import QtQuick
import Qelwatch.Ui

// A small drawn sign for the kind of a happening: filled where something was lost or refused.
Item {
    id: sign

    required property string kind

    readonly property real side: Math.round(10 * Appearance.textScale)
    readonly property bool isBad: kind === "radio-link-failure" || kind === "reject" || kind === "gap"
    readonly property bool isPlace: kind === "cell" || kind === "technology"
    readonly property bool isMark: kind === "mark"

    implicitWidth: side + 4
    implicitHeight: side + 4

    Rectangle {
        anchors.centerIn: parent
        width: sign.side
        height: sign.side
        radius: sign.isPlace ? sign.side / 2 : sign.isMark ? 0 : 2
        rotation: sign.isBad ? 45 : 0
        antialiasing: true
        color: sign.isBad ? Theme.error : sign.isMark ? Theme.accent : "transparent"
        border {
            width: 2
            color: sign.isBad ? Theme.error : sign.isPlace || sign.isMark ? Theme.accent : Theme.secondary
        }
    }
}
