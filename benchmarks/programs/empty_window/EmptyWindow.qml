import QtQuick

Window {
    width: 360
    height: 720
    visible: true

    Text {
        anchors.centerIn: parent
        text: "qelwatch"
    }
}
