import QtQuick
import Qelwatch.Ui

// The moment of an opened recording that every screen shows, and how it moves; before that, how far
// it is opened. Where it is wide it is low, as such screens are.
Rectangle {
    id: bar

    required property PlaybackModel playback

    readonly property real inset: Theme.inset(width)
    readonly property bool wide: width >= 560

    implicitHeight: playback.opening || playback.opened ? column.height + 8 : 0
    visible: implicitHeight > 0
    color: Theme.row

    component Small: Text {
        textFormat: Text.PlainText
        color: Theme.secondary
        font.pointSize: Theme.headerSize
        Accessible.role: Accessible.StaticText
        Accessible.name: text
    }

    Hairline {
        width: parent.width
    }
    Column {
        id: column
        x: bar.inset
        y: 4
        width: bar.width - 2 * x

        Item {
            width: parent.width
            height: visible ? Math.max(Theme.touch, giveUp.height) : 0
            visible: bar.playback.opening

            Small {
                anchors {
                    left: parent.left
                    right: giveUp.left
                    verticalCenter: parent.verticalCenter
                }
                text: bar.playback.progressText
                elide: Text.ElideMiddle
                Accessible.role: Accessible.ProgressBar
            }
            TextButton {
                id: giveUp
                anchors {
                    right: parent.right
                    rightMargin: -8
                }
                text: qsTr("Cancel")
                onTapped: bar.playback.giveUpOpening()
            }
        }
        Item {
            width: parent.width
            height: visible ? Math.max(title.height, close.height) : 0
            visible: bar.playback.opened

            Small {
                id: title
                anchors {
                    left: parent.left
                    right: close.left
                    verticalCenter: parent.verticalCenter
                }
                text: bar.playback.title + "  " + bar.playback.momentText
                      + (bar.playback.notes === "" ? "" : "\n" + bar.playback.notes)
                wrapMode: Text.Wrap
            }
            TextButton {
                id: close
                anchors {
                    right: parent.right
                    rightMargin: -8
                }
                text: qsTr("Close")
                onTapped: bar.playback.close()
            }
        }
        Scrubber {
            width: parent.width
            visible: bar.playback.opened && !bar.wide
            playback: bar.playback
        }
        Item {
            width: parent.width
            height: visible ? Math.max(buttons.height, place.height) : 0
            visible: bar.playback.opened

            Row {
                id: buttons
                x: -12

                SignButton {
                    text: qsTr("Happening before")
                    sign: "previous"
                    enabled: bar.playback.hasPrevious
                    onTapped: bar.playback.toPrevious()
                }
                SignButton {
                    text: bar.playback.playing ? qsTr("Pause") : qsTr("Play")
                    sign: bar.playback.playing ? "pause" : "play"
                    onTapped: bar.playback.playOrPause()
                }
                SignButton {
                    text: qsTr("Next happening")
                    sign: "next"
                    enabled: bar.playback.hasNext
                    onTapped: bar.playback.toNext()
                }
                TextButton {
                    text: bar.playback.speedText
                    Accessible.name: qsTr("Speed %1").arg(text)
                    onTapped: bar.playback.nextSpeed()
                }
            }
            Scrubber {
                anchors {
                    left: buttons.right
                    leftMargin: 8
                    right: place.left
                    rightMargin: Theme.margin
                    verticalCenter: buttons.verticalCenter
                }
                visible: bar.wide
                playback: bar.playback
            }
            Small {
                id: place
                anchors {
                    right: parent.right
                    verticalCenter: buttons.verticalCenter
                }
                width: bar.wide ? implicitWidth : parent.width - buttons.x - buttons.width
                text: bar.playback.positionText
                horizontalAlignment: Text.AlignRight
                wrapMode: Text.Wrap
            }
        }
    }
}
