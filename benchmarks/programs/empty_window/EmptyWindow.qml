import QtQuick
import QtQuick.Controls

ApplicationWindow {
    width: 360
    height: 720
    visible: true
}
