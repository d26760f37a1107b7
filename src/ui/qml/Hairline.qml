import QtQuick

Rectangle {
    implicitHeight: Theme.hairline
    color: Theme.separator
}
