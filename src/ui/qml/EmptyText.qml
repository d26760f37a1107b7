import QtQuick

// What will appear on a screen that has nothing to show yet, and what it takes.
Item {
    id: empty

    required property string title
    required property string technology
    // Does the table have a row, though without text?
    required property bool hasRows

    readonly property string sentence: hasRows
        ? qsTr("The fields of %1 appear here with the first report of the modem.").arg(subject)
        : qsTr("The last report lists nothing here. Entries of %1 appear with the next report that has some.").arg(subject)
    readonly property string subject: technology === "" ? title : technology + " " + title

    height: label.height + 4 * Theme.margin

    Text {
        id: label
        y: 2 * Theme.margin
        x: Theme.margin
        width: parent.width - 2 * Theme.margin
        text: empty.sentence
        textFormat: Text.PlainText
        color: Theme.secondary
        font.pointSize: Theme.valueSize
        horizontalAlignment: Text.AlignHCenter
        wrapMode: Text.Wrap
        lineHeight: 1.25
    }
}
