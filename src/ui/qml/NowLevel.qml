import QtQuick
import Qelwatch.Ui

// The level in large figures, how good it is, the other measured values, and two minutes of it.
Column {
    id: block

    required property NowModel now

    readonly property var level: now.level
    readonly property bool old: level.isOld ?? false

    spacing: 2

    Item {
        id: top

        readonly property bool fits:
            figure.width + unit.width + quality.width + 2 * Theme.padding <= width

        width: parent.width
        height: fits ? Math.max(figure.height, quality.height) : figure.height + quality.height + 8

        Text {
            id: figure
            visible: text !== ""
            text: block.level.figure ?? ""
            textFormat: Text.PlainText
            color: block.old ? Theme.secondary : Theme.value
            font.family: Theme.fixedFamily
            font.pointSize: Theme.figureSize
            Accessible.ignored: true
        }
        Text {
            id: unit
            anchors {
                left: figure.right
                leftMargin: 6
                baseline: figure.baseline
            }
            visible: figure.visible
            text: block.level.unit ?? ""
            textFormat: Text.PlainText
            color: Theme.secondary
            font.pointSize: Theme.nameSize
            Accessible.ignored: true
        }
        QualityBar {
            id: quality
            anchors {
                right: parent.right
                bottom: parent.bottom
                bottomMargin: 8
            }
            visible: figure.visible
            step: block.level.step ?? 0
            grade: block.level.grade ?? ""
            word: block.level.word ?? ""
            quiet: block.old
        }
    }
    Item {
        width: parent.width
        height: Math.max(others.height, badge.height)

        Flow {
            id: others
            width: parent.width - (badge.visible ? badge.width + 8 : 0)
            anchors.verticalCenter: parent.verticalCenter
            spacing: Theme.padding

            Text {
                visible: text !== ""
                text: block.level.age ?? ""
                textFormat: Text.PlainText
                color: Theme.value
                font.pointSize: Theme.nameSize
                font.weight: Font.DemiBold
                Accessible.ignored: true
            }
            Repeater {
                model: block.now.others

                Text {
                    required property var row

                    width: Math.min(implicitWidth, parent.width)
                    text: row.name + " " + row.figure + " " + row.unit
                    textFormat: Text.PlainText
                    color: Theme.secondary
                    font.pointSize: Theme.nameSize
                    wrapMode: Text.Wrap
                    Accessible.ignored: true
                }
            }
        }
        Rectangle {
            id: badge
            anchors.right: parent.right
            visible: block.now.badge !== ""
            width: Math.ceil(badgeText.implicitWidth) + 16
            height: Math.ceil(badgeText.implicitHeight) + 6
            radius: height / 2
            color: "transparent"
            border {
                width: 1
                color: Theme.secondary
            }

            Text {
                id: badgeText
                anchors.centerIn: parent
                text: block.now.badge
                textFormat: Text.PlainText
                color: Theme.value
                font.pointSize: Theme.nameSize
                font.weight: Font.DemiBold
                Accessible.ignored: true
            }
        }
    }
    Sparkline {
        width: parent.width
        height: 44
        page: block.now
        color: block.old ? Theme.secondary : Theme.accent
    }
}
