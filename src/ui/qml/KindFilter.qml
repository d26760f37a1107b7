import QtQuick
import Qelwatch.Ui

// The kinds of happenings, of which any may be chosen; none chosen shows them all.
Flickable {
    id: filter

    required property HappeningsModel happenings
    property alias count: choices.count

    implicitHeight: Math.max(Theme.touch, Math.round(metrics.height) + 2 * Theme.padding)
    contentWidth: strip.width
    flickableDirection: Flickable.HorizontalFlick
    boundsBehavior: Flickable.StopAtBounds
    clip: true
    Accessible.role: Accessible.List
    Accessible.name: qsTr("Kinds to show")

    TextMetrics {
        id: metrics
        text: "Hg"
        font.pointSize: Theme.nameSize
    }

    Row {
        id: strip
        leftPadding: Theme.inset(filter.width) - 8
        rightPadding: leftPadding
        spacing: 4

        Repeater {
            id: choices
            model: filter.happenings.kinds

            // qmllint disable unqualified
            Tappable {
                id: choice

                required property var row
                readonly property bool chosen: filter.happenings.filtered && row.shown

                width: Math.ceil(label.x + label.implicitWidth) + 14
                height: filter.implicitHeight
                text: row.name
                activeFocusOnTab: true
                onActiveFocusChanged: {
                    const wanted = x + (width - filter.width) / 2;
                    if (activeFocus)
                        filter.contentX = Math.max(0, Math.min(filter.contentWidth - filter.width, wanted));
                }
                onTapped: filter.happenings.toggle(row.kind)

                Accessible.role: Accessible.CheckBox
                Accessible.name: qsTr("%1, %2").arg(row.name).arg(row.count)
                Accessible.checkable: true
                Accessible.checked: chosen

                Rectangle {
                    anchors {
                        fill: parent
                        topMargin: 8
                        bottomMargin: 8
                    }
                    radius: height / 2
                    color: choice.chosen ? Theme.accent : "transparent"
                    border {
                        width: 1
                        color: choice.chosen ? Theme.accent : Theme.separator
                    }
                }
                HappeningSign {
                    id: sign
                    x: 12
                    y: Math.round((choice.height - height) / 2)
                    kind: choice.row.kind
                    color: choice.chosen ? Theme.page : Theme.value
                }
                Text {
                    id: label
                    anchors {
                        left: sign.right
                        leftMargin: 6
                        verticalCenter: parent.verticalCenter
                    }
                    text: choice.row.name + " " + choice.row.count
                    textFormat: Text.PlainText
                    color: choice.chosen ? Theme.page : Theme.value
                    font.pointSize: Theme.nameSize
                    Accessible.ignored: true
                }
                FocusRing {
                    visible: choice.activeFocus && Appearance.keyboardInUse
                }
            }
            // qmllint enable unqualified
        }
    }
}
