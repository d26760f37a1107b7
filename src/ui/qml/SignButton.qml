import QtQuick
import Qelwatch.Ui

// A button with a drawn sign; its text is what is said of it.
Tappable {
    id: button

    // "record", "stop", "mark", "play", "pause", "next" or "previous".
    required property string sign
    property color color: enabled ? Theme.accent : Theme.secondary

    readonly property real side: Math.round(14 * Appearance.textScale)

    implicitWidth: Math.max(Theme.touch, side + 24)
    implicitHeight: implicitWidth
    activeFocusOnTab: enabled && visible

    Accessible.role: Accessible.Button

    Item {
        anchors.centerIn: parent
        width: button.side
        height: button.side
        opacity: button.down ? 0.5 : button.enabled ? 1 : 0.4

        Rectangle {
            anchors.fill: parent
            visible: button.sign === "record" || button.sign === "stop"
            radius: button.sign === "record" ? width / 2 : 2
            color: Theme.error
        }
        // A flag.
        Rectangle {
            visible: button.sign === "mark"
            width: 2
            height: parent.height
            color: button.color
        }
        Rectangle {
            x: 2
            visible: button.sign === "mark"
            width: parent.width - 3
            height: Math.round(parent.height * 0.55)
            color: button.color
        }
        Repeater {
            model: button.sign === "pause" ? 2 : 0

            // qmllint disable unqualified
            Rectangle {
                required property int index

                x: index * button.side * 0.6 + button.side * 0.05
                width: button.side * 0.3
                height: button.side
                color: button.color
            }
            // qmllint enable unqualified
        }
        Text {
            anchors.centerIn: parent
            visible: text !== ""
            text: button.sign === "play" ? "\u25B6\uFE0E"
                : button.sign === "next" ? "\u203A|" : button.sign === "previous" ? "|\u2039" : ""
            color: button.color
            font.pointSize: Theme.titleSize
            Accessible.ignored: true
        }
    }
    FocusRing {
        visible: button.activeFocus && Appearance.keyboardInUse
    }
}
