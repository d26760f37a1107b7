import QtQuick
import Qelwatch.Ui

// One screen: its bar, what there is to say to the reader, and its table.
FocusScope {
    id: screen

    required property TableModel table
    property string notice
    property string condition
    property string source
    property string loss
    required property InterfaceDescription storyboard
    property bool isFirst

    signal back

    Accessible.role: Accessible.Pane
    Accessible.name: table.title

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

    TableList {
        id: list
        anchors {
            top: noticeBar.bottom
            bottom: footer.top
            left: parent.left
            right: parent.right
        }
        model: screen.table
        storyboard: screen.storyboard
        focus: true
        visible: !emptyText.visible
    }

    EmptyText {
        id: emptyText
        anchors {
            top: list.top
            left: parent.left
            right: parent.right
        }
        visible: screen.table.blank
        title: screen.table.title
        technology: screen.table.previousTitle
        hasRows: screen.table.count > 0
    }

    NoticeBar {
        id: noticeBar
        anchors {
            top: bar.bottom
            left: parent.left
            right: parent.right
        }
        text: screen.notice
    }

    ScreenBar {
        id: bar
        anchors {
            top: parent.top
            left: parent.left
            right: parent.right
        }
        title: screen.table.title
        previousTitle: screen.table.previousTitle
        hasBack: !screen.isFirst
        hairline: !list.atTop
        onBack: screen.back()
    }

    FirstScreenFooter {
        id: footer
        anchors {
            bottom: parent.bottom
            left: parent.left
            right: parent.right
        }
        height: screen.isFirst ? implicitHeight : 0
        visible: screen.isFirst
        source: screen.source
        condition: screen.condition
        loss: screen.loss
    }
}
