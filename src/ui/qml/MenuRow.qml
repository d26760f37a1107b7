import QtQuick
import Qelwatch.Ui

// A row of a menu: what it is called and that it leads on. The whole row is the target.
Tappable {
    id: row

    required property int index
    required text
    required property TableModel table

    readonly property real inset: Theme.inset(width)
    readonly property bool isCurrent: ListView.isCurrentItem && ((ListView.view as RowList)?.keysHere ?? false)

    width: ListView.view?.width ?? 0
    implicitHeight: Math.max(Theme.touch + 8, Math.round(label.implicitHeight) + 2 * Theme.padding)

    Accessible.role: Accessible.ListItem
    Accessible.focused: isCurrent

    onTapped: table.choose(index)

    Rectangle {
        anchors.fill: parent
        color: Theme.row

        Rectangle {
            anchors.fill: parent
            color: Theme.pressTint
            opacity: row.down ? 1 : 0

            Behavior on opacity {
                NumberAnimation {
                    duration: Theme.pressMs
                }
            }
        }
        Hairline {
            anchors {
                left: parent.left
                right: parent.right
                bottom: parent.bottom
                leftMargin: row.inset
            }
        }
        FocusRing {
            visible: row.isCurrent && Appearance.keyboardInUse
        }
    }

    Text {
        id: label
        anchors {
            left: parent.left
            right: chevron.left
            verticalCenter: parent.verticalCenter
            leftMargin: row.inset
            rightMargin: Theme.padding
        }
        text: row.text
        color: Theme.value
        font.pointSize: Theme.valueSize
        wrapMode: Text.Wrap
        Accessible.ignored: true
    }
    Chevron {
        id: chevron
        anchors {
            right: parent.right
            rightMargin: row.inset
            verticalCenter: parent.verticalCenter
        }
    }
}
