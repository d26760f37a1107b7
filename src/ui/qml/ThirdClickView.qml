import QtQuick

// The place of a field's detail.
Rectangle {
    width: ListView.view?.width ?? 0
    height: Theme.touch
    color: Theme.row
}
