import QtQuick
import Qelwatch.Ui

// A list whose rows know whether the keyboard is on them.
ListView {
    property bool keysHere: false
    // Has its reader left the top?
    property bool scrolledAway: false

    function readInOrder(): void {
        ScreenReader.readLast(footerItem);
    }

    // A list makes what stands below its rows before them.
    onCountChanged: Qt.callLater(readInOrder)
    onMovementEnded: scrolledAway = !atYBeginning
}
