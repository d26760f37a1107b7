import QtQuick
import Qelwatch.Ui

// The ways to the pages beside the tables.
Row {
    id: links

    required property Navigation navigation

    readonly property var pages: [
        {
            name: qsTr("Signals"),
            page: "signals"
        },
        {
            name: qsTr("Happenings"),
            page: "happenings"
        },
        {
            name: qsTr("Recordings"),
            page: "recordings"
        }
    ]

    Repeater {
        model: links.pages

        // qmllint disable unqualified
        TextButton {
            required property var modelData

            width: Math.floor(links.width / links.pages.length)
            text: modelData.name
            onTapped: links.navigation.open(modelData.page)
        }
        // qmllint enable unqualified
    }
}
