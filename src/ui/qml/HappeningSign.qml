import QtQuick
import Qelwatch.Ui

// The drawn sign for the kind of a happening, in the colour of its weight: lost or refused, another
// place, the rest. The shape alone tells the kind.
Sign {
    id: sign

    required property string kind

    readonly property bool isBad: kind === "radio-link-failure" || kind === "reject" || kind === "gap"
    readonly property bool isPlace: kind === "cell" || kind === "technology" || kind === "mark"

    implicitWidth: Math.round(16 * Appearance.textScale)
    implicitHeight: implicitWidth
    name: kind
    color: isBad ? Theme.error : isPlace ? Theme.accent : Theme.secondary
}
