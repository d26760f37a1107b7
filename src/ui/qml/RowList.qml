import QtQuick

// A list whose rows know whether the keyboard is on them.
ListView {
    property bool keysHere: false
    // Has its reader left the top?
    property bool scrolledAway: false

    onMovementEnded: scrolledAway = !atYBeginning
}
