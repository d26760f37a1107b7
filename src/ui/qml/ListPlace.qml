import QtQuick

// Where in a list the view is, while it moves.
Rectangle {
    required property Flickable list

    readonly property real share: list.visibleArea.heightRatio
    readonly property real track: list.height - 4

    x: list.x + list.width - width - 2
    y: list.y + 2 + list.visibleArea.yPosition * track
    width: 3
    height: Math.max(width, share * track)
    radius: width / 2
    visible: list.moving && share < 1
    color: Theme.secondary
    opacity: 0.6
}
