import QtQuick
import Qelwatch.Ui

// What every screen has: its ground, its bar, the notice under that, and its content below.
FocusScope {
    id: screen

    required property string title
    required property string subtitle
    required property string previousTitle
    required property Navigation navigation
    required property bool isFirst
    property bool atTop: true
    default property alias content: content.data
    // Whether a recording may begin here: a category's title needs the room.
    property bool mayRecord: true

    Accessible.role: Accessible.Pane
    Accessible.name: title

    Rectangle {
        anchors.fill: parent
        color: Theme.page
    }
    // The edge of a screen that slides over another.
    Hairline {
        anchors {
            right: parent.left
            top: parent.top
            bottom: parent.bottom
        }
        width: Theme.hairline
    }
    // In the order in which a screen reader tells them; the bar lies over what scrolls.
    ScreenBar {
        id: bar
        anchors {
            top: parent.top
            left: parent.left
            right: parent.right
        }
        z: 1
        title: screen.title
        subtitle: screen.subtitle
        previousTitle: screen.previousTitle
        sourceState: screen.navigation.pages.freshness.bar
        hasBack: !screen.isFirst
        hairline: !screen.atTop
        onBack: screen.navigation.back()

        RecordActions {
            recorder: screen.navigation.pages.recorder
            mayBegin: screen.mayRecord
        }
    }
    NoticeBar {
        id: noticeBar
        anchors {
            top: bar.bottom
            left: parent.left
            right: parent.right
        }
        z: 1
        text: screen.navigation.notice
    }
    FocusScope {
        id: content
        anchors {
            top: noticeBar.bottom
            bottom: parent.bottom
            left: parent.left
            right: parent.right
        }
        focus: true
    }
}
