import QtQuick
import Qelwatch.Ui

// One chart with its title, its newest value, and what is read off it. A tap or a held finger reads
// off, a drag moves through time; the keys do both. Two fingers and the wheel zoom.
FocusScope {
    id: view

    required property SignalsModel curves
    required property int index

    readonly property var facts: curves.charts[index] ?? ({})
    readonly property var newest: facts.newest ?? ({})
    readonly property bool reading: curves.readOff.chart === index
    readonly property var values: reading ? curves.readOff.values : []

    // While a finger that was held reads off.
    property bool held: false
    // While the page below is not to scroll.
    readonly property bool gesturing: held || drag.active || (finger.active && finger.joined)

    function placeOf(x: real): real {
        return (x - chart.plotLeft) / Math.max(1, chart.plotWidth);
    }

    function toggleReadingAt(x: real): void {
        const place = placeOf(x);
        const near = Math.abs((curves.readOff.place ?? -1) - place) * chart.plotWidth < 16;
        if (near)
            curves.stopReading();
        else
            curves.readAt(index, place);
    }

    implicitHeight: heading.height + Theme.chartHeight
    activeFocusOnTab: true

    Accessible.role: Accessible.Chart
    Accessible.name: reading ? curves.readOff.spoken : facts.spoken ?? ""
    Accessible.description: reading ? "" : qsTr("Decrease and increase read values off")
    Accessible.focusable: true
    Accessible.onDecreaseAction: curves.readPrevious(index)
    Accessible.onIncreaseAction: curves.readNext(index)

    Keys.onLeftPressed: event => {
        if (event.modifiers & Qt.AltModifier)
            event.accepted = false;
        else if (event.modifiers & Qt.ShiftModifier)
            curves.move(0.25);
        else
            curves.readPrevious(index);
    }
    Keys.onRightPressed: event => {
        if (event.modifiers & Qt.ShiftModifier)
            curves.move(-0.25);
        else
            curves.readNext(index);
    }
    Keys.onEscapePressed: event => {
        event.accepted = reading;
        curves.stopReading();
    }

    Item {
        id: heading
        width: parent.width
        height: Math.max(title.height, label.height) + 4

        Text {
            id: title
            anchors {
                left: parent.left
                bottom: parent.bottom
            }
            text: view.facts.title ?? ""
            textFormat: Text.PlainText
            color: Theme.secondary
            font.pointSize: Theme.headerSize
            font.weight: Font.DemiBold
            Accessible.ignored: true
        }
        // Above the curves, so that it covers none.
        Text {
            id: label
            anchors {
                left: title.right
                leftMargin: Theme.padding
                right: parent.right
                bottom: parent.bottom
            }
            text: view.reading
                  ? view.curves.readOff.time + "  "
                    + view.values.slice(0, 3).map(value => (value.label + " " + value.text).trim()).join("  ")
                  : !view.newest.figure ? ""
                  : view.newest.figure + " " + (view.facts.unit ?? "") + "  " + (view.newest.word ?? "")
            textFormat: Text.PlainText
            color: Theme.value
            font.family: Theme.fixedFamily
            font.pointSize: Theme.headerSize
            horizontalAlignment: Text.AlignRight
            wrapMode: Text.Wrap
            Accessible.ignored: true
        }
    }
    ChartCurves {
        id: chart
        anchors {
            top: heading.bottom
            left: parent.left
            right: parent.right
            bottom: parent.bottom
        }
        page: view.curves
        chart: view.index
        serving: Theme.accent
        neighbours: Theme.secondary
        lines: Theme.separator
        words: Theme.secondary
        good: Theme.good
        fair: Theme.fair
        poor: Theme.poor
        font.pointSize: Theme.axisSize

        Rectangle {
            x: Math.round(chart.plotLeft + (view.curves.readOff.place ?? 0) * chart.plotWidth)
            y: chart.plotTop
            width: 1
            height: chart.plotHeight
            visible: view.curves.readOff.place !== undefined
            color: Theme.value
        }
        Repeater {
            model: view.values

            // qmllint disable unqualified
            Rectangle {
                required property var modelData

                x: chart.plotLeft + view.curves.readOff.place * chart.plotWidth - width / 2
                y: chart.plotTop + (1 - modelData.height) * chart.plotHeight - height / 2
                width: modelData.serving ? 9 : 5
                height: width
                radius: width / 2
                color: modelData.serving ? Theme.accent : Theme.secondary
            }
            // qmllint enable unqualified
        }

        // The first finger, whatever its gesture becomes.
        PointHandler {
            id: finger

            property real lastX: 0
            property bool mayTap: false
            property bool joined: false // by a second

            acceptedButtons: Qt.LeftButton
            onGrabChanged: (transition, eventPoint) => {
                if (transition === PointerDevice.GrabPassive) {
                    view.forceActiveFocus(Qt.MouseFocusReason);
                    mayTap = true;
                    joined = false;
                    hold.restart();
                    return;
                }
                // One that was taken away, not lifted, is no tap.
                if (mayTap && !view.held && eventPoint.state & Qt.TouchPointReleased)
                    view.toggleReadingAt(lastX);
                mayTap = view.held = false;
                hold.stop();
            }
            onPointChanged: {
                if (!active)
                    return;
                lastX = point.position.x;
                const way = Qt.vector2d(point.scenePosition.x - point.scenePressPosition.x,
                                        point.scenePosition.y - point.scenePressPosition.y);
                if (way.length() > Qt.styleHints.startDragDistance)
                    mayTap = false;
                if (view.held)
                    view.curves.readAt(view.index, view.placeOf(lastX));
            }
        }
        Timer {
            id: hold
            interval: 250
            onTriggered: {
                view.held = finger.mayTap;
                if (view.held)
                    view.curves.readAt(view.index, view.placeOf(finger.lastX));
            }
        }
        DragHandler {
            id: drag

            property real movedTo: 0

            target: null
            enabled: !view.held
            yAxis.enabled: false
            grabPermissions: PointerHandler.CanTakeOverFromItems
                             | PointerHandler.ApprovesTakeOverByHandlersOfDifferentType
            // Who is left of two goes on from where it is.
            onActiveChanged: movedTo = finger.joined ? centroid.position.x : centroid.pressPosition.x
            onCentroidChanged: {
                if (!active)
                    return;
                view.curves.move((centroid.position.x - movedTo) / Math.max(1, chart.plotWidth));
                movedTo = centroid.position.x;
            }
        }
        PinchHandler {
            property real before: 1

            target: null
            onGrabChanged: transition => {
                if (transition !== PointerDevice.GrabPassive)
                    return;
                finger.joined = true;
                finger.mayTap = view.held = false;
            }
            onActiveChanged: before = 1
            onActiveScaleChanged: {
                if (!active || activeScale <= 0)
                    return;
                view.curves.zoom(before / activeScale, view.placeOf(centroid.position.x));
                before = activeScale;
            }
        }
        WheelHandler {
            target: null
            acceptedDevices: PointerDevice.Mouse | PointerDevice.TouchPad
            onWheel: event => view.curves.zoom(event.angleDelta.y > 0 ? 0.8 : 1.25, view.placeOf(event.x))
        }
    }
    FocusRing {
        anchors.margins: -6
        visible: view.activeFocus && Appearance.keyboardInUse
    }
}
