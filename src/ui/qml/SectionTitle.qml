import QtQuick

// What a part of a page is about.
Text {
    leftPadding: Theme.inset(width)
    rightPadding: leftPadding
    topPadding: Theme.padding
    bottomPadding: Theme.padding / 2
    textFormat: Text.PlainText
    color: Theme.secondary
    font.pointSize: Theme.headerSize
    font.weight: Font.DemiBold
    wrapMode: Text.Wrap
    Accessible.role: Accessible.Heading
    Accessible.name: text
}
