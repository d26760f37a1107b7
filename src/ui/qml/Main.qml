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

    Binding {
        target: navigation.pages
        property: "shown"
        value: Appearance.seen
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
    // Made when a recording is first opened, and each time anew.
    Loader {
        id: playback

        readonly property PlaybackModel model: navigation.pages?.playback ?? null
        readonly property bool wanted: (model?.opening ?? false) || (model?.opened ?? false)

        anchors {
            left: parent.left
            right: parent.right
            bottom: parent.bottom
        }
        height: (item as Item)?.implicitHeight ?? 0
        onWantedChanged: {
            if (wanted)
                setSource("PlaybackBar.qml", { playback: model });
            else
                source = "";
        }
    }
    // Made with the first field that is asked for, and kept.
    Loader {
        id: sheet

        readonly property bool opened: navigation.pages?.sheet.opened ?? false

        anchors.fill: parent
        focus: opened
        onOpenedChanged: {
            if (!opened)
                stack.forceActiveFocus();
            else if (!item)
                setSource("FieldSheet.qml", { sheet: navigation.pages.sheet, focus: true });
        }
    }
}
