import QtQuick
import Qelwatch.Ui

// A drawn angle that points to where a tap leads.
Item {
    id: chevron

    property bool pointsLeft: false
    property color color: Theme.accent
    readonly property real arm: Math.round(9 * Appearance.textScale)

    implicitWidth: Math.ceil(arm * 0.8) + 2
    implicitHeight: Math.ceil(arm * 1.5) + 2

    Repeater {
        model: [-1, 1]

        Rectangle {
            required property int modelData
            readonly property int side: chevron.pointsLeft ? -1 : 1

            x: (chevron.width - width) / 2
            y: chevron.height / 2 - height / 2 + modelData * (chevron.arm - height) * 0.35
            width: chevron.arm
            height: 2
            radius: 1
            color: chevron.color
            rotation: -side * modelData * 45
            antialiasing: true
        }
    }
}
