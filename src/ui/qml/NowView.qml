import QtQuick
import Qelwatch.Ui

// The answer at a glance: the level, read from an arm's length, and which cell it is of. A tap leads
// to the curves.
Tappable {
    id: view

    required property NowModel now

    readonly property bool knows: now.lines.count > 0
    readonly property bool wide: width >= 560
    readonly property real inset: Theme.inset(width)
    readonly property real inner: width - 2 * inset
    readonly property bool old: now.level.isOld ?? false

    text: now.spoken
    implicitHeight: (knows ? facts.height : reasons.height) + 2 * Theme.padding
    height: implicitHeight
    activeFocusOnTab: true

    Accessible.role: Accessible.Button
    Accessible.description: qsTr("Opens the curves")

    Rectangle {
        anchors.fill: parent
        color: Theme.pressTint
        visible: view.down
    }
    Column {
        id: reasons
        x: view.inset
        y: Theme.padding
        width: view.inner
        visible: !view.knows
        spacing: 4

        Text {
            width: parent.width
            text: view.now.reason
            textFormat: Text.PlainText
            color: Theme.value
            font.pointSize: Theme.valueSize
            wrapMode: Text.Wrap
            Accessible.ignored: true
        }
        Text {
            width: parent.width
            visible: text !== ""
            text: view.now.advice
            textFormat: Text.PlainText
            color: Theme.secondary
            font.pointSize: Theme.nameSize
            wrapMode: Text.Wrap
            Accessible.ignored: true
        }
    }
    Flow {
        id: facts
        x: view.inset
        y: Theme.padding
        width: view.inner
        visible: view.knows
        spacing: Theme.padding

        // Made with the first cell that is known.
        Loader {
            readonly property bool wanted: view.knows

            width: view.wide ? Math.floor((view.inner - Theme.padding) * 0.45) : view.inner
            onWantedChanged: {
                if (wanted && !item)
                    setSource("NowLevel.qml", { now: view.now });
            }
        }
        Column {
            width: view.wide ? Math.floor((view.inner - Theme.padding) * 0.55) : view.inner
            spacing: 2

            Repeater {
                model: view.now.lines

                // qmllint disable unqualified
                Text {
                    required property var row

                    width: parent.width
                    text: row.text
                    textFormat: Text.PlainText
                    color: row.known && !view.old ? Theme.value : Theme.secondary
                    font.pointSize: Theme.valueSize
                    wrapMode: Text.Wrap
                    Accessible.ignored: true
                }
                // qmllint enable unqualified
            }
        }
    }
    FocusRing {
        visible: view.activeFocus && Appearance.keyboardInUse
    }
}
