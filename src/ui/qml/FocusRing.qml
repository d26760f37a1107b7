import QtQuick

// Shows where the keyboard is, while it is the keyboard that is used.
Rectangle {
    anchors {
        fill: parent
        margins: 2
    }
    color: "transparent"
    radius: 6
    border {
        width: 2
        color: Theme.accent
    }
}
