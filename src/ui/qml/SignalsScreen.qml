import QtQuick
import Qelwatch.Ui

// The curves of the serving cell and its strongest neighbours, and the neighbours as a table below.
Screen {
    id: screen

    readonly property SignalsModel curves: navigation.pages.curves
    readonly property real inset: Theme.inset(width)

    atTop: flick.atYBeginning

    Binding {
        target: screen.curves
        property: "columns"
        value: Math.round(screen.width)
    }

    Item {
        anchors.fill: parent

        Keys.onPressed: event => {
            const ways = {
                [Qt.Key_Plus]: () => screen.curves.zoom(0.5, 1),
                [Qt.Key_Equal]: () => screen.curves.zoom(0.5, 1),
                [Qt.Key_Minus]: () => screen.curves.zoom(2, 1),
                [Qt.Key_End]: () => screen.curves.toEnd(),
                [Qt.Key_Up]: () => flick.scrollBy(-60),
                [Qt.Key_Down]: () => flick.scrollBy(60),
                [Qt.Key_PageUp]: () => flick.scrollBy(-flick.height * 0.8),
                [Qt.Key_PageDown]: () => flick.scrollBy(flick.height * 0.8)
            };
            const way = ways[event.key];
            if (way === undefined)
                return;
            event.accepted = true;
            way();
        }

        Flickable {
            id: flick

            function scrollBy(distance: real): void {
                contentY = Math.max(0, Math.min(contentHeight - height, contentY + distance));
            }

            anchors.fill: parent
            contentHeight: column.height
            boundsBehavior: Flickable.StopAtBounds
            clip: true

            Column {
                id: column
                width: flick.width

                NothingYet {
                    x: screen.inset
                    width: parent.width - 2 * x
                    topPadding: 2 * Theme.margin
                    bottomPadding: 2 * Theme.margin
                    visible: text !== ""
                    text: screen.curves.notice
                }
                // The time that is shown, and the buttons beside it or, where it is too wide, below.
                Item {
                    id: spanLine

                    readonly property bool beside: span.implicitWidth <= width - zoomRow.width

                    x: screen.inset
                    width: parent.width - 2 * x
                    height: beside ? Math.max(zoomRow.height, span.height + 8) : span.height + zoomRow.height
                    visible: screen.curves.chartCount > 0

                    Text {
                        id: span
                        y: spanLine.beside ? Math.round((spanLine.height - height) / 2) : 0
                        width: parent.width - (spanLine.beside ? zoomRow.width : 0)
                        text: screen.curves.span
                        textFormat: Text.PlainText
                        color: Theme.secondary
                        font.pointSize: Theme.nameSize
                        wrapMode: Text.Wrap
                        Accessible.role: Accessible.StaticText
                        Accessible.name: text
                    }
                    Row {
                        id: zoomRow
                        anchors {
                            right: parent.right
                            bottom: parent.bottom
                        }

                        TextButton {
                            visible: !screen.curves.isAtEnd
                            text: qsTr("Now")
                            onTapped: screen.curves.toEnd()
                        }
                        TextButton {
                            text: "\u2212"
                            large: true
                            enabled: screen.curves.canZoomOut
                            Accessible.name: qsTr("Show more time")
                            onTapped: screen.curves.zoom(2, 1)
                        }
                        TextButton {
                            text: "+"
                            large: true
                            enabled: screen.curves.canZoomIn
                            Accessible.name: qsTr("Show less time")
                            onTapped: screen.curves.zoom(0.5, 1)
                        }
                    }
                }
                Item {
                    x: screen.inset
                    width: parent.width - 2 * x
                    height: charts.height

                    Column {
                        id: charts
                        width: parent.width
                        spacing: Theme.padding

                        Repeater {
                            model: screen.curves.chartCount

                            // qmllint disable unqualified
                            ChartView {
                                width: charts.width
                                height: implicitHeight
                                curves: screen.curves
                                focus: index === 0
                                onGesturingChanged: flick.interactive = !gesturing
                                Component.onDestruction: flick.interactive = true
                            }
                            // qmllint enable unqualified
                        }
                    }
                }
                SectionTitle {
                    width: parent.width
                    visible: screen.curves.chartCount > 0
                    text: qsTr("Neighbours")
                }
                NothingYet {
                    x: screen.inset
                    width: parent.width - 2 * x
                    bottomPadding: Theme.margin
                    visible: text !== "" && screen.curves.chartCount > 0
                    text: screen.curves.neighboursNotice
                }
                Repeater {
                    model: screen.curves.neighbours

                    // qmllint disable unqualified
                    NeighbourRow {
                        width: column.width
                    }
                    // qmllint enable unqualified
                }
                Item {
                    width: parent.width
                    height: Theme.margin
                }
            }
        }
        ListPlace {
            list: flick
        }
    }
}
