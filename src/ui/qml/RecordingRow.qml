import QtQuick
import Qelwatch.Ui

// A recording: a tap opens it, the button at the right deletes it. That stands below where large text
// leaves no room beside it.
Tappable {
    id: line

    required property var row
    required property int index

    readonly property real inset: Theme.inset(width)
    readonly property bool isCurrent: ListView.isCurrentItem && ((ListView.view as RowList)?.keysHere ?? false)
    readonly property bool beside: title.implicitWidth <= width - 2 * inset - remove.width
    readonly property var facts: [row.length, row.size, row.cells].filter(part => part)

    signal deleted

    width: ListView.view?.width ?? 0
    implicitHeight: Math.max(Theme.touch + 8, texts.height + 2 * Theme.padding + (beside ? 0 : remove.height))
    text: row.title

    Accessible.role: Accessible.ListItem
    Accessible.name: [row.title, ...facts, row.fault].filter(part => part).join(", ")
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
        x: line.inset
        y: line.beside ? Math.round((line.height - height) / 2) : Theme.padding
        width: line.width - 2 * x - (line.beside ? remove.width : 0)
        spacing: 2

        Text {
            id: title
            width: parent.width
            text: line.row.title
            textFormat: Text.PlainText
            color: Theme.value
            font.pointSize: Theme.valueSize
            wrapMode: Text.Wrap
            Accessible.ignored: true
        }
        Text {
            width: parent.width
            visible: text !== ""
            text: line.facts.join("  \u00B7  ")
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
        }
        y: line.beside ? Math.round((line.height - height) / 2) : texts.y + texts.height
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
