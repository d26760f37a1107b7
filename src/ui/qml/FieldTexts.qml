import QtQuick
import Qelwatch.Ui

// A name and its value: side by side when both fit on one line, else one above the other. A value
// without text shows as a dash.
Item {
    id: texts

    required property string name
    required property string value
    // Words rather than a value.
    property bool prose: false

    readonly property bool blank: value === ""
    readonly property bool sideBySide:
        nameLabel.implicitWidth + Theme.margin + valueLabel.implicitWidth <= width
    readonly property int spacing: 4

    height: Math.ceil(sideBySide ? Math.max(nameLabel.height, valueLabel.height)
                                 : nameLabel.height + spacing + valueLabel.height)

    Text {
        id: nameLabel
        y: texts.sideBySide ? valueLabel.baselineOffset - baselineOffset : 0
        width: texts.sideBySide ? implicitWidth : parent.width
        text: Theme.breakable(texts.name)
        textFormat: Text.PlainText
        color: Theme.secondary
        font.pointSize: Theme.nameSize
        wrapMode: Text.Wrap
        Accessible.ignored: true
    }
    Text {
        id: valueLabel
        y: texts.sideBySide ? 0 : nameLabel.height + texts.spacing
        width: parent.width
        horizontalAlignment: texts.sideBySide ? Text.AlignRight : Text.AlignLeft
        text: texts.blank ? "\u2013" : Theme.breakable(texts.value)
        textFormat: Text.PlainText
        color: texts.blank ? Theme.secondary : Theme.value
        font.family: texts.prose ? nameLabel.font.family : Theme.fixedFamily
        font.pointSize: Theme.valueSize
        wrapMode: Text.Wrap
        Accessible.ignored: true
    }
}
