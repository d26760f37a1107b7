import QtQuick

// The title of a screen, what stands small under it, the way back at the left and what can be done
// at the right. The title stands in the middle where it can, beside the way back where it must, and
// takes another line before it loses a letter.
Rectangle {
    id: bar

    required property string title
    // What the title belongs to; said here, so that the way back need not.
    required property string subtitle
    // How it is with the source, in a word or two; empty: as it should be.
    property string sourceState
    required property string previousTitle
    required property bool hasBack
    required property bool hairline
    default property alias actions: actionRow.data

    signal back

    readonly property bool nameFits: subtitle === "" && widest <= width - 2 * backButton.fullWidth - 16
    readonly property bool crowded: metrics.advanceWidth + 1 > width - narrowEdge - rightEdge
    readonly property bool centred: widest <= width - 2 * Math.max(leftEdge, rightEdge)
    readonly property real widest: Math.max(label.implicitWidth, lower.implicitWidth)
    readonly property real narrowEdge:
        hasBack ? Math.max(Theme.touch, backButton.shortWidth) + 4 : Theme.margin
    readonly property real leftEdge: hasBack ? backButton.width + 4 : Theme.margin
    readonly property real rightEdge: actionRow.width > 0 ? actionRow.width + 4 : Theme.margin
    readonly property real room: width - leftEdge - rightEdge

    height: lower.visible ? Math.max(56, Math.round(label.height + lower.height) + Theme.padding)
                          : Math.max(56, Math.round(label.height) + 2 * Theme.padding)
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
    Text {
        id: label
        x: bar.centred ? Math.round((bar.width - width) / 2) : bar.leftEdge
        y: Math.round((bar.height - height - (lower.visible ? lower.height : 0)) / 2)
        width: Math.min(Math.ceil(implicitWidth), bar.room)
        text: bar.title
        textFormat: Text.PlainText
        color: Theme.value
        font: bar.crowded ? small.font : metrics.font
        // A single word cannot take another line.
        wrapMode: text.includes(" ") ? Text.Wrap : Text.NoWrap
        fontSizeMode: text.includes(" ") ? Text.FixedSize : Text.HorizontalFit
        minimumPointSize: Theme.nameSize
        Accessible.role: Accessible.Heading
        Accessible.name: bar.subtitle === "" ? bar.title : bar.title + ", " + bar.subtitle
    }
    Text {
        id: lower
        x: bar.centred ? Math.round((bar.width - width) / 2) : bar.leftEdge
        y: label.y + label.height
        width: Math.min(Math.ceil(implicitWidth), bar.room)
        visible: text !== ""
        text: bar.subtitle + (bar.subtitle !== "" && bar.sourceState !== "" ? " \u00B7 " : "") + bar.sourceState
        textFormat: Text.PlainText
        color: Theme.secondary
        font.pointSize: Theme.headerSize
        wrapMode: Text.Wrap
        Accessible.role: Accessible.StaticText
        Accessible.name: text
    }
    BackButton {
        id: backButton
        height: parent.height
        visible: bar.hasBack
        showsName: bar.nameFits
        text: bar.previousTitle
        onTapped: bar.back()
    }
    Row {
        id: actionRow
        anchors {
            right: parent.right
            rightMargin: 4
            verticalCenter: parent.verticalCenter
        }
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
