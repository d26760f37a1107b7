import QtQuick
import Qelwatch.Ui

// A list whose rows know whether the keyboard is on them.
ListView {
    property bool keysHere: false
    // Has its reader left the top?
    property bool scrolledAway: false

    // A list makes what stands below its rows before them.
    onContentHeightChanged: ScreenReader.readLast(footerItem)
    onMovementEnded: scrolledAway = !atYBeginning
}
