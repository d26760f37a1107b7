import QtQuick
import Qelwatch.Ui

// One happening: when, what, and the record that told it; the words below the time where large text
// leaves no room beside it.
Rectangle {
    id: line

    required property var row
    required property int index

    readonly property real inset: Theme.inset(width)
    readonly property real besideTime: sign.x + sign.width + 8 + time.width + Theme.padding
    readonly property bool beside: width - inset - besideTime >= 1.75 * time.width
    readonly property real above: beside ? 0 : time.height + 2
    readonly property bool isCurrent: ListView.isCurrentItem && ((ListView.view as RowList)?.keysHere ?? false)

    width: ListView.view?.width ?? 0
    implicitHeight: Math.max(Theme.touch, above + texts.height + 2 * Theme.padding - 4)
    color: Theme.row

    Accessible.role: Accessible.ListItem
    Accessible.name: row.spoken
    Accessible.focusable: true
    Accessible.focused: isCurrent

    HappeningSign {
        id: sign
        x: line.inset
        y: time.y + Math.round((time.height - height) / 2)
        kind: line.row.kind
    }
    Text {
        id: time
        anchors {
            left: sign.right
            leftMargin: 8
        }
        y: texts.y - line.above
        text: line.row.time
        textFormat: Text.PlainText
        color: Theme.secondary
        font.family: Theme.fixedFamily
        font.pointSize: Theme.nameSize
        Accessible.ignored: true
    }
    Column {
        id: texts
        x: line.beside ? line.besideTime : line.inset
        y: Math.round((line.height + line.above - height) / 2)
        width: line.width - x - line.inset
        spacing: 2

        Text {
            width: parent.width
            text: line.row.text
            textFormat: Text.PlainText
            color: Theme.value
            font.pointSize: Theme.nameSize
            wrapMode: Text.Wrap
            Accessible.ignored: true
        }
        Text {
            width: parent.width
            visible: text !== ""
            text: line.row.record
            textFormat: Text.PlainText
            color: Theme.secondary
            font.pointSize: Theme.axisSize
            wrapMode: Text.WrapAnywhere
            Accessible.ignored: true
        }
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
