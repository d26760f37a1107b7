import QtQuick
import Qelwatch.Ui

// What will appear on a screen that has nothing to show yet, and what it takes.
Item {
    id: empty

    required property TableModel table

    readonly property string title: table.title
    readonly property string technology: table.previousTitle
    // Is there a row, though without text?
    readonly property bool hasRows: table.count > 0
    readonly property string sentence: hasRows
        ? qsTr("The fields of %1 appear here with the first report of the modem.").arg(subject)
        : qsTr("The last report of %1 lists nothing. The next one that lists something appears here.").arg(subject)
    // A title may name the technology itself.
    readonly property bool namesItself: technology === "" || title.startsWith(technology + " ")
    readonly property string subject: namesItself ? title : technology + " " + title

    implicitHeight: label.height + 4 * Theme.margin

    NothingYet {
        id: label
        y: 2 * Theme.margin
        x: Theme.inset(empty.width)
        width: empty.width - 2 * x
        text: empty.sentence
    }
}
