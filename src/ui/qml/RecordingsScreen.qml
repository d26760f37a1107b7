import QtQuick
import Qelwatch.Ui

// The recordings on this device: open one, delete one, or begin one.
Screen {
    id: screen

    readonly property RecordingsModel recordings: navigation.pages.recordings
    readonly property RecorderModel recorder: navigation.pages.recorder
    readonly property PlaybackModel playback: navigation.pages.playback

    function openRow(index: int): void {
        const name = recordings.rows.idAt(index);
        if (name !== "")
            navigation.pages.openRecording(name);
    }

    atTop: list.atYBeginning

    ListKeys {
        id: keys
        anchors.fill: list
        focus: true
        list: list
        onChosen: row => screen.openRow(row)
        Keys.onDeletePressed: screen.recordings.remove(screen.recordings.rows.idAt(list.currentIndex))
    }
    RowList {
        id: list
        anchors {
            top: parent.top
            bottom: undo.top
            left: parent.left
            right: parent.right
        }
        keysHere: keys.activeFocus
        model: screen.recordings.rows
        header: head
        footer: foot
        clip: true
        boundsBehavior: Flickable.StopAtBounds
        keyNavigationEnabled: false
        highlightFollowsCurrentItem: false
        Accessible.role: Accessible.List
        Accessible.name: screen.title
        // qmllint disable unqualified
        delegate: RecordingRow {
            onTapped: screen.openRow(index)
            onDeleted: screen.recordings.remove(row.name)
        }
        // qmllint enable unqualified
    }
    ListPlace {
        list: list
    }
    Component {
        id: head

        // qmllint disable unqualified
        Column {
            width: list.width
            topPadding: Theme.padding
            bottomPadding: 8

            PageLine {
                text: screen.recorder.recording ? screen.recorder.text : screen.recorder.outcome
                color: Theme.value
            }
            PageLine {
                text: screen.recorder.hiddenText
            }
            PageLine {
                text: screen.playback.error
                color: Theme.error
            }
            PageLine {
                text: screen.recordings.error
                color: Theme.error
            }
        }
        // qmllint enable unqualified
    }
    Component {
        id: foot

        // qmllint disable unqualified
        NothingYet {
            x: Theme.inset(list.width)
            width: list.width - 2 * x
            topPadding: Theme.margin
            bottomPadding: Theme.margin
            text: screen.recordings.emptyText || screen.recordings.totalText
        }
        // qmllint enable unqualified
    }
    Rectangle {
        id: undo
        anchors {
            left: parent.left
            right: parent.right
            bottom: parent.bottom
        }
        height: visible ? Math.max(undoButton.height, undoText.height) : 0
        visible: screen.recordings.undoText !== ""
        color: Theme.noticeGround

        Text {
            id: undoText
            anchors {
                left: parent.left
                leftMargin: Theme.inset(parent.width)
                right: undoButton.left
                verticalCenter: parent.verticalCenter
            }
            text: screen.recordings.undoText
            textFormat: Text.PlainText
            color: Theme.noticeText
            font.pointSize: Theme.nameSize
            wrapMode: Text.Wrap
            Accessible.role: Accessible.AlertMessage
            Accessible.name: text
        }
        TextButton {
            id: undoButton
            anchors {
                right: parent.right
                rightMargin: Theme.inset(parent.width) - 8
            }
            text: qsTr("Undo")
            color: Theme.noticeText
            strong: true
            onTapped: screen.recordings.undo()
        }
    }
}
