import QtQuick
import Qelwatch.Ui

// A drawn angle that points to where a tap leads.
Item {
    id: chevron

    property bool pointsLeft: false
    property color color: Theme.accent
    readonly property real arm: Math.round(9 * Appearance.textScale)

    component Arm: Rectangle {
        // 1: the lower arm, -1: the upper one.
        required property int side

        y: (parent.height - height) / 2 + side * (width - height) * 0.35
        anchors.horizontalCenter: parent.horizontalCenter
        height: 2
        radius: 1
        antialiasing: true
    }

    implicitWidth: Math.ceil(arm * 0.8) + 2
    implicitHeight: Math.ceil(arm * 1.5) + 2

    Arm {
        side: -1
        width: chevron.arm
        color: chevron.color
        rotation: chevron.pointsLeft ? -45 : 45
    }
    Arm {
        side: 1
        width: chevron.arm
        color: chevron.color
        rotation: chevron.pointsLeft ? 45 : -45
    }
}
