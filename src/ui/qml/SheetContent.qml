import QtQuick
import Qelwatch.Ui

// The value large, its curve, and what is known of it in pairs.
Column {
    id: content

    required property SheetModel sheet

    // For a screen reader.
    readonly property string spokenValue:
        (sheet.value || qsTr("empty")) + (sheet.unit && " " + sheet.unit) + (sheet.word && " " + sheet.word)
    // From the top of the value's line to the top of smaller words that stand on it.
    readonly property real drop: Math.round(large.ascent - small.ascent)

    spacing: Theme.padding

    FontMetrics {
        id: large
        font.family: Theme.fixedFamily
        font.pointSize: Theme.titleSize * 1.4
    }
    FontMetrics {
        id: small
        font.pointSize: Theme.valueSize
    }
    Text {
        width: parent.width
        text: content.sheet.label
        textFormat: Text.PlainText
        color: Theme.value
        font.pointSize: Theme.titleSize
        font.weight: Font.DemiBold
        wrapMode: Text.Wrap
        Accessible.role: Accessible.Heading
        Accessible.name: text
    }
    Text {
        width: parent.width
        text: Theme.breakable(content.sheet.key + "  \u00B7  " + content.sheet.place)
        Accessible.role: Accessible.StaticText
        Accessible.name: content.sheet.key + ", " + content.sheet.place
        textFormat: Text.PlainText
        color: Theme.secondary
        font.pointSize: Theme.headerSize
        wrapMode: Text.Wrap
    }
    Flow {
        width: parent.width
        spacing: 8

        Text {
            Accessible.role: Accessible.StaticText
            Accessible.name: content.spokenValue
            width: Math.min(implicitWidth, parent.width)
            text: Theme.breakable(content.sheet.value === "" ? "\u2013" : content.sheet.value)
            textFormat: Text.PlainText
            color: Theme.value
            font.family: Theme.fixedFamily
            font.pointSize: Theme.titleSize * 1.4
            wrapMode: Text.Wrap
        }
        Text {
            Accessible.ignored: true
            visible: text !== ""
            text: content.sheet.unit
            topPadding: content.drop
            textFormat: Text.PlainText
            color: Theme.secondary
            font.pointSize: Theme.valueSize
        }
        Text {
            Accessible.ignored: true
            visible: text !== ""
            text: content.sheet.word
            topPadding: content.drop
            textFormat: Text.PlainText
            color: Theme.qualityColor(text)
            font.pointSize: Theme.valueSize
            font.weight: Font.DemiBold
        }
    }
    SheetCurve {
        width: parent.width
        height: visible ? 56 : 0
        visible: content.sheet.hasCurve
        sheet: content.sheet
        color: Theme.accent
        Accessible.role: Accessible.Graphic
        Accessible.name: qsTr("Curve of ten minutes: %1").arg(content.sheet.curveText)
    }
    Repeater {
        model: content.sheet.lines

        // qmllint disable unqualified
        FieldTexts {
            required property var row

            width: content.width
            name: row.label
            value: row.value
            prose: row.prose
            Accessible.role: Accessible.ListItem
            Accessible.name: row.label + ": " + row.value
        }
        // qmllint enable unqualified
    }
}
