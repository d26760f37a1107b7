import QtQuick
import Qelwatch.Ui

// Begins a recording; while one is made, marks a moment and ends it.
Row {
    id: actions

    required property RecorderModel recorder
    // Is this a screen on which one may begin?
    required property bool mayBegin

    readonly property bool recording: recorder.recording
    readonly property bool begins: mayBegin && recorder.available && !recording
    readonly property var ways: ({
        mark: { text: qsTr("Mark this moment"), go: () => recorder.mark() },
        stop: { text: qsTr("Stop recording"), go: () => recorder.stop() },
        record: { text: qsTr("Record"), go: () => recorder.start() }
    })

    Repeater {
        model: actions.recording ? ["mark", "stop"] : actions.begins ? ["record"] : []

        // qmllint disable unqualified
        SignButton {
            required property string modelData

            text: actions.ways[modelData].text
            sign: modelData
            onTapped: actions.ways[modelData].go()
        }
        // qmllint enable unqualified
    }
}
