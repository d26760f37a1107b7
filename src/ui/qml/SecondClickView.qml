import QtQuick
import Qelwatch.Ui

// A field and its value: side by side when both fit on one line, else one above the other. A text
// that is its own value is a notice to the reader.
Rectangle {
    id: row

    required property string text
    required property string detail
    required property bool notice
    required property int changes

    readonly property int inner: width - 2 * Theme.margin
    readonly property bool sideBySide: name.implicitWidth + Theme.margin + value.implicitWidth <= inner
    readonly property bool isCurrent: ListView.isCurrentItem && (ListView.view?.activeFocus ?? false)

    width: ListView.view?.width ?? 0
    height: Math.max(Theme.touch, texts.height + 2 * Theme.padding)
    color: notice ? Theme.noticeGround : Theme.row

    // A row that comes into sight is not one that changed.
    Component.onCompleted: fade.complete()
    ListView.onReused: fade.complete()
    onChangesChanged: {
        if (changes > 0 && Theme.changeMs > 0)
            fade.restart();
    }

    Accessible.role: Accessible.ListItem
    Accessible.name: notice ? text : text + ": " + detail
    Accessible.focusable: true
    Accessible.focused: isCurrent

    Rectangle {
        id: tint

        // So thin a colour fades in a few steps as smoothly as in many, and every step is drawn.
        readonly property int steps: 8
        property real strength: 0

        anchors.fill: parent
        color: Theme.pressTint
        opacity: Math.ceil(strength * steps) / steps

        NumberAnimation {
            id: fade
            target: tint
            property: "strength"
            from: 1
            to: 0
            duration: Theme.changeMs
        }
    }

    Item {
        id: texts

        readonly property int spacing: 4

        x: Theme.margin
        y: Math.round((row.height - height) / 2)
        width: row.inner
        height: Math.ceil(row.notice ? name.height
                        : row.sideBySide ? Math.max(name.height, value.height)
                        : name.height + spacing + value.height)

        Text {
            id: name
            y: row.sideBySide ? value.baselineOffset - baselineOffset : 0
            width: row.sideBySide && !row.notice ? implicitWidth : parent.width
            text: Theme.breakable(row.text)
            textFormat: Text.PlainText
            color: row.notice ? Theme.noticeText : Theme.secondary
            font.pointSize: Theme.nameSize
            wrapMode: Text.Wrap
            Accessible.ignored: true
        }
        Text {
            id: value
            y: row.sideBySide ? 0 : name.height + texts.spacing
            width: parent.width
            visible: !row.notice
            horizontalAlignment: row.sideBySide ? Text.AlignRight : Text.AlignLeft
            text: Theme.breakable(row.detail)
            textFormat: Text.PlainText
            color: Theme.value
            font.family: Theme.fixedFamily
            font.pointSize: Theme.valueSize
            wrapMode: Text.Wrap
            Accessible.ignored: true
        }
    }

    Hairline {
        anchors {
            left: parent.left
            right: parent.right
            bottom: parent.bottom
            leftMargin: Theme.margin
        }
    }
    FocusRing {
        visible: row.isCurrent && Appearance.keyboardInUse
    }
}
