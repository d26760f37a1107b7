import QtQuick
import Qelwatch.Ui

// A button with a drawn sign; its text is what is said of it.
Tappable {
    id: button

    // "record", "stop", "mark", "play", "pause", "next" or "previous".
    required property string sign
    readonly property bool isOfRecording: sign === "record" || sign === "stop"
    property color color: !enabled ? Theme.secondary : isOfRecording ? Theme.error : Theme.accent

    readonly property real side: Math.round(16 * Appearance.textScale)

    implicitWidth: Math.max(Theme.touch, side + 24)
    implicitHeight: implicitWidth
    activeFocusOnTab: enabled && visible

    Accessible.role: Accessible.Button

    Sign {
        x: Math.round((button.width - width) / 2)
        y: Math.round((button.height - height) / 2)
        width: button.side
        height: button.side
        opacity: button.down ? 0.5 : button.enabled ? 1 : 0.4
        name: button.sign
        color: button.color
    }
    FocusRing {
        visible: button.activeFocus && Appearance.keyboardInUse
    }
}
