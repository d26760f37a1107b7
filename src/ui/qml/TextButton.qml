import QtQuick
import Qelwatch.Ui

// A word that does something.
Tappable {
    id: button

    property bool strong: false
    property bool large: false
    property color color: enabled ? Theme.accent : Theme.secondary

    implicitWidth: Math.max(Theme.touch, Math.ceil(label.implicitWidth) + 2 * 8)
    implicitHeight: Math.max(Theme.touch, Math.ceil(label.implicitHeight) + Theme.padding)
    activeFocusOnTab: enabled

    Accessible.role: Accessible.Button

    Text {
        id: label
        anchors.centerIn: parent
        width: Math.min(Math.ceil(implicitWidth), button.width - 4)
        text: button.text
        textFormat: Text.PlainText
        color: button.color
        font.pointSize: button.large ? Theme.titleSize : Theme.nameSize
        font.weight: button.strong ? Font.DemiBold : Font.Normal
        horizontalAlignment: Text.AlignHCenter
        wrapMode: Text.Wrap
        opacity: button.down ? 0.5 : 1
        Accessible.ignored: true
    }
    FocusRing {
        visible: button.activeFocus && Appearance.keyboardInUse
    }
}
