import QtQuick
import Qelwatch.Ui

// The ways to the pages, where the values come from and how they come, how it is with the modem, what
// is not shown, and the choice between light and dark.
Item {
    id: footer

    required property Navigation navigation
    property string source
    property string flow
    property string condition
    property string loss

    readonly property var choices: [
        {
            name: qsTr("System"),
            theme: Appearance.System
        },
        {
            name: qsTr("Light"),
            theme: Appearance.Light
        },
        {
            name: qsTr("Dark"),
            theme: Appearance.Dark
        }
    ]
    // As much room beside the names as the width leaves.
    readonly property real sidePadding: {
        const left = Math.min(width, Theme.contentWidth) - 2 * Theme.margin - names.advanceWidth;
        return Math.max(4, Math.min(Theme.margin, left / (2 * choices.length)));
    }

    component Line: Text {
        x: Theme.inset(parent.width)
        width: parent.width - 2 * x
        bottomPadding: 4
        visible: text !== ""
        textFormat: Text.PlainText
        color: Theme.secondary
        font.pointSize: Theme.headerSize
        horizontalAlignment: Text.AlignHCenter
        wrapMode: Text.Wrap
        Accessible.role: Accessible.StaticText
        Accessible.name: text
    }

    implicitHeight: column.height + Theme.padding

    TextMetrics {
        id: names
        text: footer.choices.map(choice => choice.name).join("")
        font.pointSize: Theme.nameSize
        font.weight: Font.DemiBold
    }

    Column {
        id: column
        width: parent.width

        PageLinks {
            x: Theme.inset(parent.width) - Theme.margin
            width: parent.width - 2 * x
            navigation: footer.navigation
        }
        Line {
            topPadding: Theme.padding
            text: footer.source
        }
        Line {
            text: footer.condition
            color: Theme.value
        }
        Line {
            text: footer.flow
        }
        Line {
            text: footer.loss
        }
        Row {
            anchors.horizontalCenter: parent.horizontalCenter

            Repeater {
                model: footer.choices

                // qmllint disable unqualified
                ThemeChoice {
                    required property var modelData

                    sidePadding: footer.sidePadding
                    text: modelData.name
                    checked: Appearance.theme === modelData.theme
                    onTapped: Appearance.theme = modelData.theme
                }
                // qmllint enable unqualified
            }
        }
    }
}
