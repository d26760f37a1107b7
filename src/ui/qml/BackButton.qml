import QtQuick
import Qelwatch.Ui

// Leads to the screen before, by name when there is room for it.
Tappable {
    id: button

    // Width with the name and without it.
    readonly property real fullWidth: shortWidth + 6 + Math.ceil(label.implicitWidth)
    readonly property real shortWidth: Theme.margin + chevron.width + 8
    property bool showsName: true

    width: Math.max(Theme.touch, showsName ? fullWidth : shortWidth)
    activeFocusOnTab: true

    Accessible.role: Accessible.Button
    Accessible.name: qsTr("Back to %1").arg(text)

    Chevron {
        id: chevron
        x: Theme.margin - 4
        anchors.verticalCenter: parent.verticalCenter
        pointsLeft: true
        opacity: button.down ? 0.5 : 1
    }
    Text {
        id: label
        anchors {
            left: chevron.right
            leftMargin: 6
            verticalCenter: parent.verticalCenter
        }
        visible: button.showsName
        text: button.text
        textFormat: Text.PlainText
        color: Theme.accent
        font.pointSize: Theme.valueSize
        opacity: button.down ? 0.5 : 1
        Accessible.ignored: true
    }
    FocusRing {
        visible: button.activeFocus && Appearance.keyboardInUse
    }
}
