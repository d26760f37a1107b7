import QtQuick

// The title of a section; nothing for a section without one.
Rectangle {
    id: header

    required property string section

    width: ListView.view?.width ?? 0
    height: section === "" ? 0 : Math.round(label.implicitHeight) + 2 * Theme.padding - 4
    visible: section !== ""
    color: Theme.page

    Accessible.role: Accessible.Heading
    Accessible.name: section
    Accessible.ignored: section === ""

    Text {
        id: label
        anchors {
            left: parent.left
            right: parent.right
            bottom: parent.bottom
            leftMargin: Theme.inset(header.width)
            rightMargin: Theme.inset(header.width)
            bottomMargin: Theme.padding / 2
        }
        text: header.section
        color: Theme.secondary
        font.pointSize: Theme.headerSize
        font.weight: Font.DemiBold
        wrapMode: Text.Wrap
        Accessible.ignored: true
    }
}
