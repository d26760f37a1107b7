import QtQuick
import Qelwatch.Ui

// The screens of the navigation stack side by side, of which one is seen. `position` is the screen
// in sight; it follows the stack, or the finger that drags from the left edge.
FocusScope {
    id: stack

    required property Navigation navigation
    property string source

    readonly property int target: navigation.depth - 1
    property real position: 0
    property int shown: -1
    readonly property bool moving: slide.running || edge.active
    // The same as in a terminal.
    readonly property var pageKeys: ({
        [Qt.Key_S]: "signals",
        [Qt.Key_H]: "happenings",
        [Qt.Key_R]: "recordings"
    })
    // What shows each kind of screen, loaded when the first of its kind comes.
    readonly property var faces: ({
        table: "TableScreen.qml",
        signals: "SignalsScreen.qml",
        happenings: "HappeningsScreen.qml",
        recordings: "RecordingsScreen.qml"
    })

    function glide(): void {
        slide.stop();
        slide.duration = Theme.slideMs * Math.min(1, Math.abs(target - position));
        slide.to = target;
        slide.start();
    }

    function release(speed: real): void {
        const farEnough = position < target - 0.4;
        if ((farEnough && speed > -200) || speed > 400)
            navigation.back();
        else
            glide();
    }

    onTargetChanged: {
        const isFirst = shown < 0;
        shown = target;
        glide();
        if (!isFirst && Theme.guardMs > 0)
            guard.restart();
    }

    Keys.onPressed: event => {
        const isBack = event.key === Qt.Key_Escape || event.key === Qt.Key_Back
            || event.key === Qt.Key_Backspace
            || (event.key === Qt.Key_Left && (event.modifiers & Qt.AltModifier));
        if (isBack && target > 0) {
            event.accepted = true;
            navigation.back();
        }
        const page = pageKeys[event.key];
        if (page !== undefined && event.modifiers === Qt.NoModifier) {
            event.accepted = true;
            navigation.open(page);
        }
        const recorder = navigation.pages.recorder;
        if (event.key === Qt.Key_R && event.modifiers === Qt.ShiftModifier) {
            event.accepted = true;
            if (recorder.recording)
                recorder.stop();
            else
                recorder.start();
        }
        if (event.key === Qt.Key_M && event.modifiers === Qt.NoModifier) {
            event.accepted = true;
            recorder.mark();
        }
    }

    NumberAnimation {
        id: slide
        target: stack
        property: "position"
        easing.type: Easing.OutCubic
        onFinished: stack.navigation.settle()
    }

    Repeater {
        model: stack.navigation

        // qmllint disable unqualified
        Loader {
            required property int index
            required property string kind
            required property string title
            required property string subtitle
            required property string previousTitle
            // Null for a page.
            required property TableModel table
            readonly property real away: index - stack.position

            width: stack.width
            height: stack.height
            x: Math.round(away * width * (away > 0 ? 1 : 0.3))
            z: index
            visible: away > -1 && away < 1
            focus: index === stack.target
            enabled: focus && !edge.active
            Component.onCompleted: setSource(stack.faces[kind], Object.assign({
                navigation: stack.navigation,
                isFirst: index === 0,
                title: title,
                subtitle: subtitle,
                previousTitle: previousTitle,
                focus: true
            }, table ? { table: table, source: stack.source } : {}))
        }
        // qmllint enable unqualified
    }

    // Taps on what slides are meant for what was there before.
    MouseArea {
        anchors.fill: parent
        z: 999
        enabled: stack.moving || guard.running
        visible: enabled
        Accessible.ignored: true
    }
    Timer {
        id: guard
        interval: Theme.guardMs
    }

    Item {
        width: 20
        height: stack.height
        z: 1000

        DragHandler {
            id: edge

            property real start: 0
            property real speed: 0

            target: null
            enabled: stack.target > 0
            yAxis.enabled: false
            onActiveChanged: {
                if (active) {
                    slide.stop();
                    start = stack.position;
                } else {
                    stack.release(speed);
                }
            }
            onTranslationChanged: {
                if (!active)
                    return;
                speed = centroid.velocity.x;
                const wanted = start - translation.x / stack.width;
                stack.position = Math.max(stack.target - 1, Math.min(stack.target, wanted));
            }
        }
    }
}
