import QtQuick
import Qelwatch.Ui

// A screen that is one table.
Screen {
    id: screen

    required property TableModel table
    property string source

    atTop: list.atTop

    TableList {
        id: list
        anchors.fill: parent
        model: screen.table
        storyboard: screen.navigation.storyboard
        focus: true
        visible: !emptyText.visible
        footer: screen.isFirst ? firstFooter : null
    }
    EmptyText {
        id: emptyText
        anchors {
            top: parent.top
            left: parent.left
            right: parent.right
        }
        visible: screen.table.blank
        title: screen.table.title
        technology: screen.table.previousTitle
        hasRows: screen.table.count > 0
    }
    Component {
        id: firstFooter

        // qmllint disable unqualified
        FirstScreenFooter {
            width: list.width
            source: screen.source
            condition: screen.navigation.condition
            loss: screen.navigation.loss
        }
        // qmllint enable unqualified
    }
}
