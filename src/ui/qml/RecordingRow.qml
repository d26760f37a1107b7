import QtQuick
import Qelwatch.Ui

// A recording: a tap opens it, the button at the right deletes it.
Tappable {
    id: line

    required property var row
    required property int index

    readonly property real inset: Theme.inset(width)
    readonly property bool isCurrent: ListView.isCurrentItem && ((ListView.view as RowList)?.keysHere ?? false)
    readonly property string facts:
        [row.length, row.size, row.cells].filter(part => part).join("  \u00B7  ")

    signal deleted

    width: ListView.view?.width ?? 0
    implicitHeight: Math.max(Theme.touch + 8, texts.height + 2 * Theme.padding)
    text: row.title

    Accessible.role: Accessible.ListItem
    Accessible.name: [row.title, facts, row.fault].filter(part => part).join(", ")
    Accessible.focused: isCurrent

    Rectangle {
        anchors.fill: parent
        color: Theme.row
    }
    Rectangle {
        anchors.fill: parent
        color: Theme.pressTint
        visible: line.down
    }
    Column {
        id: texts
        anchors {
            left: parent.left
            leftMargin: line.inset
            right: remove.left
            rightMargin: 8
            verticalCenter: parent.verticalCenter
        }
        spacing: 2

        Text {
            width: parent.width
            text: line.row.title
            textFormat: Text.PlainText
            color: Theme.value
            font.pointSize: Theme.valueSize
            wrapMode: Text.WrapAnywhere
            Accessible.ignored: true
        }
        Text {
            width: parent.width
            visible: text !== ""
            text: line.facts
            textFormat: Text.PlainText
            color: Theme.secondary
            font.pointSize: Theme.nameSize
            wrapMode: Text.Wrap
            Accessible.ignored: true
        }
        Text {
            width: parent.width
            visible: text !== ""
            text: line.row.fault
            textFormat: Text.PlainText
            color: Theme.error
            font.pointSize: Theme.nameSize
            wrapMode: Text.Wrap
            Accessible.ignored: true
        }
    }
    TextButton {
        id: remove
        anchors {
            right: parent.right
            rightMargin: line.inset - 8
            verticalCenter: parent.verticalCenter
        }
        width: visible ? implicitWidth : 0
        visible: !line.row.growing
        text: qsTr("Delete")
        Accessible.name: qsTr("Delete %1").arg(line.row.title)
        onTapped: line.deleted()
    }
    Hairline {
        anchors {
            left: parent.left
            right: parent.right
            bottom: parent.bottom
            leftMargin: line.inset
        }
    }
    FocusRing {
        visible: line.isCurrent && Appearance.keyboardInUse
    }
}
