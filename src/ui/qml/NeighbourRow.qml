import QtQuick
import Qelwatch.Ui

// One neighbour: which cell it is, how strong, and how much that is over the serving cell.
Rectangle {
    id: line

    required property var row

    readonly property real inset: Theme.inset(width)
    readonly property bool fits: name.implicitWidth + values.implicitWidth + Theme.padding
                                 <= width - 2 * inset

    implicitHeight: Math.max(Theme.touch - 8, texts.height + Theme.padding)
    color: Theme.row

    Accessible.role: Accessible.ListItem
    Accessible.name: row.spoken

    Item {
        id: texts
        x: line.inset
        width: line.width - 2 * x
        height: line.fits ? Math.max(name.height, values.height) : name.height + values.height + 2
        anchors.verticalCenter: parent.verticalCenter

        Text {
            id: name
            y: line.fits ? values.baselineOffset - baselineOffset : 0
            width: line.fits ? implicitWidth : parent.width
            text: line.row.name + "  " + line.row.channel + (line.row.age ? "  " + line.row.age : "")
            textFormat: Text.PlainText
            color: Theme.secondary
            font.pointSize: Theme.nameSize
            font.weight: line.row.hasCurve ? Font.DemiBold : Font.Normal
            wrapMode: Text.Wrap
            Accessible.ignored: true
        }
        Text {
            id: values
            y: line.fits ? 0 : name.height + 2
            anchors.right: parent.right
            width: line.fits ? implicitWidth : parent.width
            text: [line.row.level, line.row.quality, line.row.difference].filter(part => part).join("  ")
            textFormat: Text.PlainText
            color: Theme.value
            font.family: Theme.fixedFamily
            font.pointSize: Theme.nameSize
            horizontalAlignment: Text.AlignRight
            wrapMode: Text.Wrap
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
}
