import QtQuick
import Qelwatch.Ui

// All that is known of one field, from below over the table. A swipe down, a tap beside it, Escape
// and the way back close it.
FocusScope {
    id: overlay

    required property SheetModel sheet

    readonly property bool opened: sheet.opened
    readonly property real restY: Math.max(Theme.touch, height - Math.min(height * 0.92, fullHeight))
    readonly property real fullHeight: handle.height + content.height + Theme.margin
    property real drag: 0

    visible: opened || panel.y < height
    onOpenedChanged: {
        drag = 0;
        if (opened) {
            forceActiveFocus();
            ScreenReader.enter(panel);
        }
    }

    Keys.onPressed: event => {
        const ways = {
            [Qt.Key_Escape]: () => overlay.sheet.close(),
            [Qt.Key_Back]: () => overlay.sheet.close(),
            [Qt.Key_Backspace]: () => overlay.sheet.close(),
            [Qt.Key_C]: () => overlay.sheet.copy(),
            [Qt.Key_Up]: () => flick.scrollBy(-60),
            [Qt.Key_Down]: () => flick.scrollBy(60)
        };
        const way = ways[event.key];
        if (way !== undefined)
            way();
        event.accepted = event.key !== Qt.Key_Tab && event.key !== Qt.Key_Backtab;
    }

    Rectangle {
        anchors.fill: parent
        color: Theme.shade
        opacity: overlay.opened ? 1 : 0

        Behavior on opacity {
            NumberAnimation {
                duration: Theme.slideMs
            }
        }
    }
    MouseArea {
        anchors.fill: parent
        enabled: overlay.opened
        onClicked: overlay.sheet.close()
        onWheel: wheel => wheel.accepted = true
        Accessible.ignored: true
    }
    Rectangle {
        id: panel
        x: Math.max(0, Math.round((overlay.width - width) / 2))
        y: overlay.opened ? Math.round(overlay.restY + overlay.drag) : overlay.height
        width: Math.min(overlay.width, Theme.contentWidth)
        height: overlay.height - overlay.restY + radius
        radius: 12
        color: Theme.row

        Accessible.role: Accessible.Dialog
        Accessible.name: overlay.sheet.label + ": " + content.spokenValue
        Accessible.focusable: true

        Behavior on y {
            enabled: !swipe.active

            NumberAnimation {
                duration: Theme.slideMs
                easing.type: Easing.OutCubic
            }
        }

        // Takes what is meant for the sheet and not for the table below.
        MouseArea {
            anchors.fill: parent
            onWheel: wheel => wheel.accepted = true
            Accessible.ignored: true
        }
        Item {
            id: handle
            width: parent.width
            height: Math.max(Theme.touch, copy.height)

            Rectangle {
                anchors.horizontalCenter: parent.horizontalCenter
                y: 8
                width: 40
                height: 4
                radius: 2
                color: Theme.secondary
            }
            DragHandler {
                id: swipe
                target: null
                xAxis.enabled: false
                onTranslationChanged: {
                    if (active)
                        overlay.drag = Math.max(0, translation.y);
                }
                onActiveChanged: {
                    if (active)
                        return;
                    const farEnough = overlay.drag > 80 || centroid.velocity.y > 600;
                    if (farEnough)
                        overlay.sheet.close();
                    overlay.drag = 0;
                }
            }
            TextButton {
                id: copy
                anchors {
                    left: parent.left
                    leftMargin: 8
                    bottom: parent.bottom
                }
                text: qsTr("Copy")
                onTapped: overlay.sheet.copy()
            }
            TextButton {
                anchors {
                    right: parent.right
                    rightMargin: 8
                    bottom: parent.bottom
                }
                text: qsTr("Close")
                onTapped: overlay.sheet.close()
            }
        }
        Flickable {
            id: flick

            function scrollBy(distance: real): void {
                contentY = Math.max(0, Math.min(contentHeight - height, contentY + distance));
            }

            anchors {
                top: handle.bottom
                left: parent.left
                right: parent.right
                bottom: parent.bottom
                bottomMargin: panel.radius
            }
            contentHeight: content.height + Theme.margin
            boundsBehavior: Flickable.StopAtBounds
            clip: true

            SheetContent {
                id: content
                x: Theme.margin
                width: flick.width - 2 * x
                sheet: overlay.sheet
            }
        }
    }
}
