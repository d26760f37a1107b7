import QtQuick

// A line to the reader, gone while there is nothing to say.
Rectangle {
    id: bar

    property string text

    height: text === "" ? 0 : Math.ceil(label.implicitHeight) + 2 * Theme.padding
    visible: text !== ""
    color: Theme.noticeGround

    Accessible.role: Accessible.AlertMessage
    Accessible.name: text
    Accessible.ignored: text === ""

    Text {
        id: label
        anchors {
            left: parent.left
            right: parent.right
            verticalCenter: parent.verticalCenter
            margins: Theme.inset(bar.width)
        }
        text: bar.text
        textFormat: Text.PlainText
        color: Theme.noticeText
        font.pointSize: Theme.nameSize
        wrapMode: Text.Wrap
        Accessible.ignored: true
    }
}
