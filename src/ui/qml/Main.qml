import QtQuick
import Qelwatch.Ui

Window {
    id: window

    // Where the values come from, in words for the first screen.
    property string source
    readonly property Navigation navigation: navigation

    width: 360
    height: 720
    minimumWidth: 240
    minimumHeight: 240
    visible: true
    title: Application.displayName
    color: Theme.page

    Navigation {
        id: navigation
        storyboard: Storyboard {}
    }

    ScreenStack {
        anchors.fill: parent
        focus: true
        navigation: navigation
        source: window.source
    }
}
