import QtQuick
import Qelwatch.Ui

// A field and its value: side by side when both fit on one line, else one above the other. A row
// that only stands for what has not come yet says so quietly, and is no field.
Tappable {
    id: row

    required property int index
    required text
    required property string detail
    required property bool notice
    required property int changes
    required property TableModel table

    readonly property bool isCurrent: ListView.isCurrentItem && ((ListView.view as RowList)?.keysHere ?? false)

    width: ListView.view?.width ?? 0
    // Alone it looks as a table without rows does.
    height: !notice ? Math.max(Theme.touch, texts.height + 2 * Theme.padding)
          : ListView.view?.count === 1 ? nothing.height + 4 * Theme.margin
          : Math.max(Theme.touch, nothing.height + Theme.padding)

    onTapped: table.choose(index)

    // A row that comes into sight is not one that changed.
    Component.onCompleted: tint.stepsLeft = 0
    ListView.onReused: tint.stepsLeft = 0
    onChangesChanged: {
        if (changes === 0 || Theme.changeMs === 0)
            return;
        tint.stepsLeft = tint.steps;
        fade.restart();
    }

    Accessible.role: Accessible.ListItem
    Accessible.name: notice ? text : (text ? text + ": " : "") + (texts.blank ? qsTr("empty") : detail)
    Accessible.focused: isCurrent

    Rectangle {
        anchors.fill: parent
        color: row.notice ? Theme.page : Theme.row
    }
    Rectangle {
        anchors.fill: parent
        color: Theme.pressTint
        visible: row.down && !row.notice
    }
    Rectangle {
        id: tint

        // Every step is a frame, which costs as much as that of the values themselves.
        readonly property int steps: 1
        property int stepsLeft: 0

        anchors.fill: parent
        color: Theme.pressTint
        opacity: stepsLeft / steps

        Timer {
            id: fade
            interval: Theme.changeMs / tint.steps
            repeat: true
            running: tint.stepsLeft > 0
            onTriggered: --tint.stepsLeft
        }
    }

    FieldTexts {
        id: texts
        x: Theme.inset(row.width)
        y: Math.round((row.height - height) / 2)
        width: row.width - 2 * x
        visible: !row.notice
        name: row.notice ? "" : row.text
        value: row.notice ? "" : row.detail
    }
    NothingYet {
        id: nothing
        x: Theme.inset(row.width)
        anchors.verticalCenter: parent.verticalCenter
        width: row.width - 2 * x
        visible: row.notice
        text: row.notice ? row.text : ""
        Accessible.ignored: true
    }
    Hairline {
        anchors {
            left: parent.left
            right: parent.right
            bottom: parent.bottom
            leftMargin: Theme.inset(row.width)
        }
        visible: !row.notice
    }
    FocusRing {
        visible: row.isCurrent && Appearance.keyboardInUse
    }
}
