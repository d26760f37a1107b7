import QtQuick
import Qelwatch.Ui

// One of the ways the window can look; the chosen one is underlined.
Tappable {
    id: choice

    required property real sidePadding
    property bool checked: false

    implicitWidth: Math.max(Theme.touch, label.implicitWidth + 2 * sidePadding)
    implicitHeight: Math.max(Theme.touch, label.implicitHeight + 2 * Theme.padding)
    activeFocusOnTab: true

    Accessible.role: Accessible.RadioButton
    Accessible.checkable: true
    Accessible.checked: checked

    Text {
        id: label
        anchors.centerIn: parent
        text: choice.text
        color: choice.checked ? Theme.accent : Theme.secondary
        font.pointSize: Theme.nameSize
        font.weight: choice.checked ? Font.DemiBold : Font.Normal
        opacity: choice.down ? 0.5 : 1
        Accessible.ignored: true
    }
    Rectangle {
        anchors {
            top: label.bottom
            topMargin: 4
            horizontalCenter: parent.horizontalCenter
        }
        width: label.contentWidth
        height: 2
        visible: choice.checked
        color: Theme.accent
    }
    FocusRing {
        visible: choice.activeFocus && Appearance.keyboardInUse
    }
}
