import QtQuick

// Whatever a finger, a key or an assistive tool sets off. A drag that scrolls lets go of it.
MouseArea {
    id: tappable

    property string text
    readonly property bool down: containsPress

    signal tapped

    onClicked: tapped()

    Accessible.name: text
    Accessible.focusable: true
    Accessible.description: enabled ? "" : qsTr("Not now")
    Accessible.onPressAction: {
        if (enabled)
            tapped();
    }

    Keys.onReturnPressed: tapped()
    Keys.onEnterPressed: tapped()
    Keys.onSpacePressed: tapped()
}
