import QtQuick
import Qelwatch.Ui

// The length of an opened recording as a line, and the moment on it as a knob.
Item {
    id: scrubber

    required property PlaybackModel playback

    // As assistive tools read it, and move it.
    property real value: 0
    readonly property real minimumValue: 0
    readonly property real maximumValue: 1
    readonly property real stepSize: 0.01

    function jump(x: real): void {
        playback.jumpTo((x - knob.width / 2) / Math.max(1, width - knob.width));
    }

    implicitHeight: Theme.touch
    activeFocusOnTab: true
    onValueChanged: {
        if (value !== playback.position)
            playback.jumpTo(value);
    }

    Accessible.role: Accessible.Slider
    Accessible.name: qsTr("Moment of the recording, %1").arg(playback.positionText)
    Accessible.focusable: true
    Accessible.onIncreaseAction: playback.step(10)
    Accessible.onDecreaseAction: playback.step(-10)

    Keys.onLeftPressed: playback.step(-10)
    Keys.onRightPressed: playback.step(10)
    Keys.onSpacePressed: playback.playOrPause()
    Keys.onPressed: event => {
        if (event.key === Qt.Key_Home || event.key === Qt.Key_End) {
            event.accepted = true;
            playback.jumpTo(event.key === Qt.Key_Home ? 0 : 1);
        }
    }

    Binding {
        target: scrubber
        property: "value"
        value: scrubber.playback.position
        restoreMode: Binding.RestoreNone
    }

    Rectangle {
        anchors.verticalCenter: parent.verticalCenter
        width: parent.width
        height: 4
        radius: 2
        color: Theme.separator

        Rectangle {
            width: knob.x + knob.width / 2
            height: parent.height
            radius: 2
            color: Theme.accent
        }
    }
    Rectangle {
        id: knob
        x: Math.round(scrubber.playback.position * (scrubber.width - width))
        anchors.verticalCenter: parent.verticalCenter
        width: 18
        height: 18
        radius: 9
        color: Theme.accent
    }
    MouseArea {
        anchors.fill: parent
        preventStealing: true
        onPressed: mouse => scrubber.jump(mouse.x)
        onPositionChanged: mouse => scrubber.jump(mouse.x)
        Accessible.ignored: true
    }
    FocusRing {
        visible: scrubber.activeFocus && Appearance.keyboardInUse
    }
}
