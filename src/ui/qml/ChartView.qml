import QtQuick
import Qelwatch.Ui

// One chart with its title, its newest value, and what is read off it. A tap or a held finger reads
// off, a drag moves through time; the keys do both.
FocusScope {
    id: view

    required property SignalsModel curves
    required property int index

    readonly property var facts: curves.charts[index] ?? ({})
    readonly property var newest: facts.newest ?? ({})
    readonly property bool reading: curves.readOff.chart === index
    readonly property var values: reading ? curves.readOff.values : []

    function placeOf(x: real): real {
        return (x - chart.plotLeft) / Math.max(1, chart.plotWidth);
    }

    implicitHeight: heading.height + Theme.chartHeight
    activeFocusOnTab: true

    Accessible.role: Accessible.Chart
    Accessible.name: reading ? curves.readOff.spoken : facts.spoken ?? ""
    Accessible.focusable: true

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
    }
    MouseArea {
        id: finger

        property real pressedAt: 0
        property real movedTo: 0
        property bool held: false
        property bool drags: false

        anchors.fill: chart
        preventStealing: held || drags
        pressAndHoldInterval: 250
        Accessible.ignored: true

        onPressed: mouse => {
            view.forceActiveFocus(Qt.MouseFocusReason);
            pressedAt = movedTo = mouse.x;
            held = drags = false;
        }
        onPressAndHold: mouse => {
            if (drags)
                return;
            held = true;
            view.curves.readAt(view.index, view.placeOf(mouse.x));
        }
        onPositionChanged: mouse => {
            if (held) {
                view.curves.readAt(view.index, view.placeOf(mouse.x));
            } else if (drags || Math.abs(mouse.x - pressedAt) > 12) {
                drags = true;
                view.curves.move((mouse.x - movedTo) / Math.max(1, chart.plotWidth));
                movedTo = mouse.x;
            }
        }
        onClicked: mouse => {
            if (held || drags)
                return;
            const place = view.placeOf(mouse.x);
            const near = Math.abs((view.curves.readOff.place ?? -1) - place) * chart.plotWidth < 16;
            if (near)
                view.curves.stopReading();
            else
                view.curves.readAt(view.index, place);
        }
        onWheel: wheel => view.curves.zoom(wheel.angleDelta.y > 0 ? 0.8 : 1.25, view.placeOf(wheel.x))
    }
    FocusRing {
        anchors.margins: -6
        visible: view.activeFocus && Appearance.keyboardInUse
    }
}
