import QtQuick
import Qelwatch.Ui

// Begins a recording; while one is made, marks a moment and ends it.
Row {
    id: actions

    required property RecorderModel recorder
    // Is this a screen on which one may begin?
    required property bool mayBegin

    SignButton {
        visible: actions.recorder.recording
        text: qsTr("Mark this moment")
        sign: "mark"
        onTapped: actions.recorder.mark()
    }
    SignButton {
        visible: actions.recorder.recording
        text: qsTr("Stop recording")
        sign: "stop"
        onTapped: actions.recorder.stop()
    }
    SignButton {
        visible: actions.mayBegin && actions.recorder.available && !actions.recorder.recording
        text: qsTr("Record")
        sign: "record"
        onTapped: actions.recorder.start()
    }
}
