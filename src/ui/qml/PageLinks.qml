import QtQuick
import Qelwatch.Ui

// The ways to the pages beside the tables: beside each other where their words fit, else one above
// the other.
Grid {
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

    readonly property real widest:
        pages.reduce((widest, page) => Math.max(widest, metrics.advanceWidth(page.name)), 0) + 16

    columns: widest * pages.length <= width ? pages.length : 1

    FontMetrics {
        id: metrics
        font.pointSize: Theme.nameSize
    }
    Repeater {
        model: links.pages

        // qmllint disable unqualified
        TextButton {
            required property var modelData

            width: Math.floor(links.width / links.columns)
            text: modelData.name
            onTapped: links.navigation.open(modelData.page)
        }
        // qmllint enable unqualified
    }
}
