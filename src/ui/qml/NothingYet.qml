import QtQuick

// What is said where a value will be: one look for all that has not come yet.
Text {
    textFormat: Text.PlainText
    color: Theme.secondary
    font.pointSize: Theme.nameSize
    font.italic: true
    horizontalAlignment: Text.AlignHCenter
    wrapMode: Text.Wrap
    lineHeight: 1.25
    Accessible.role: Accessible.StaticText
    Accessible.name: text
}
