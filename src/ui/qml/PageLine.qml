import QtQuick

// A line of a page about itself, gone while there is nothing to say.
Text {
    x: Theme.inset(parent?.width ?? 0)
    width: (parent?.width ?? 0) - 2 * x
    bottomPadding: 4
    visible: text !== ""
    textFormat: Text.PlainText
    color: Theme.secondary
    font.pointSize: Theme.nameSize
    wrapMode: Text.Wrap
    Accessible.role: Accessible.StaticText
    Accessible.name: text
}
