import QtQuick

// The title of a screen and the way back. The title stands in the middle where it can, beside the
// way back where it must, and takes another line before it loses a letter.
Rectangle {
    id: bar

    required property string title
    required property string previousTitle
    required property bool hasBack
    required property bool hairline

    signal back

    readonly property bool nameFits: metrics.advanceWidth <= width - 2 * backButton.fullWidth - 16
    readonly property bool crowded: metrics.advanceWidth > width - backButton.shortWidth - 2 * Theme.margin
    readonly property bool centred: label.implicitWidth <= width - 2 * leftEdge
    readonly property real leftEdge: hasBack ? backButton.width + 4 : Theme.margin
    readonly property real room: width - leftEdge - Theme.margin

    height: Math.max(56, Math.round(label.height) + 2 * Theme.padding)
    color: Theme.page

    // A title that does not fit on one line is set smaller.
    TextMetrics {
        id: metrics
        text: bar.title
        font.pointSize: Theme.titleSize
        font.weight: Font.DemiBold
    }
    TextMetrics {
        id: small
        font.pointSize: Theme.valueSize
        font.weight: Font.DemiBold
    }
    BackButton {
        id: backButton
        height: parent.height
        visible: bar.hasBack
        showsName: bar.nameFits
        text: bar.previousTitle
        onTapped: bar.back()
    }
    Text {
        id: label
        x: bar.centred ? Math.round((bar.width - width) / 2) : bar.leftEdge
        width: Math.min(Math.ceil(implicitWidth), bar.room)
        anchors.verticalCenter: parent.verticalCenter
        text: bar.title
        textFormat: Text.PlainText
        color: Theme.value
        font: bar.crowded ? small.font : metrics.font
        wrapMode: Text.Wrap
        Accessible.role: Accessible.Heading
        Accessible.name: bar.title
    }
    Hairline {
        anchors {
            left: parent.left
            right: parent.right
            bottom: parent.bottom
        }
        visible: bar.hairline
    }
}
