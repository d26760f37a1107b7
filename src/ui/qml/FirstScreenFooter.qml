import QtQuick
import Qelwatch.Ui

// Where the values come from, and the choice between light and dark.
Item {
    id: footer

    property string source

    implicitHeight: column.height + Theme.padding

    Column {
        id: column
        width: parent.width

        Text {
            x: Theme.margin
            width: parent.width - 2 * Theme.margin
            bottomPadding: 4
            visible: text !== ""
            text: footer.source
            textFormat: Text.PlainText
            color: Theme.secondary
            font.pointSize: Theme.headerSize
            horizontalAlignment: Text.AlignHCenter
            wrapMode: Text.Wrap
        }
        Row {
            anchors.horizontalCenter: parent.horizontalCenter

            Repeater {
                model: [
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

                ThemeChoice {
                    required property var modelData

                    text: modelData.name
                    checked: Appearance.theme === modelData.theme
                    onClicked: Appearance.theme = modelData.theme
                }
            }
        }
    }
}
