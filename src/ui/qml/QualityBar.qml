import QtQuick
import Qelwatch.Ui

// Five steps, of which as many are filled as the level is good, and the word for it.
Row {
    id: bar

    required property int step
    required property string grade
    required property string word
    property bool quiet: false

    readonly property color color: quiet ? Theme.secondary : Theme.qualityColor(grade)

    spacing: 3

    Repeater {
        model: 5

        // qmllint disable unqualified
        Rectangle {
            required property int index

            anchors.bottom: parent.bottom
            anchors.bottomMargin: 3
            width: Math.round(6 * Appearance.textScale)
            height: Math.round((6 + 4 * index) * Appearance.textScale)
            radius: 1
            color: index < bar.step ? bar.color : "transparent"
            border {
                width: 1
                color: index < bar.step ? bar.color : Theme.secondary
            }
        }
        // qmllint enable unqualified
    }
    Text {
        anchors.bottom: parent.bottom
        leftPadding: 5
        text: bar.word
        textFormat: Text.PlainText
        color: bar.color
        font.pointSize: Theme.valueSize
        font.weight: Font.DemiBold
        Accessible.ignored: true
    }
}
