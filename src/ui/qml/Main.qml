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
        id: stack
        anchors {
            top: parent.top
            left: parent.left
            right: parent.right
            bottom: playback.top
        }
        focus: !sheet.opened
        navigation: navigation
        source: window.source
    }
    Loader {
        id: playback
        anchors {
            left: parent.left
            right: parent.right
            bottom: parent.bottom
        }
        height: (item as Item)?.implicitHeight ?? 0
        active: (navigation.pages?.playback.opening ?? false) || (navigation.pages?.playback.opened ?? false)
        // qmllint disable unqualified
        sourceComponent: PlaybackBar {
            playback: navigation.pages.playback
        }
        // qmllint enable unqualified
    }
    Loader {
        id: sheet

        readonly property bool opened: navigation.pages?.sheet.opened ?? false

        anchors.fill: parent
        // Made with the first field that is asked for, and kept.
        active: false
        focus: opened
        onOpenedChanged: {
            if (opened)
                active = true;
            else
                stack.forceActiveFocus();
        }
        // qmllint disable unqualified
        sourceComponent: FieldSheet {
            sheet: navigation.pages.sheet
            focus: true
        }
        // qmllint enable unqualified
    }
}
