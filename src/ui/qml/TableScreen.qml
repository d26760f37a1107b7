import QtQuick
import Qelwatch.Ui

// A screen that is one table.
Screen {
    id: screen

    required property TableModel table
    property string source

    atTop: list.atTop

    mayRecord: isFirst

    TableList {
        id: list
        anchors.fill: parent
        model: screen.table
        storyboard: screen.navigation.storyboard
        focus: true
        visible: !emptyText.wanted
        header: screen.isFirst ? firstHeader : null
        footer: screen.isFirst ? firstFooter : null
    }
    // Made for the first table without text.
    Loader {
        id: emptyText

        readonly property bool wanted: screen.table.blank

        anchors {
            top: parent.top
            left: parent.left
            right: parent.right
        }
        visible: wanted
        onWantedChanged: {
            if (wanted && !item)
                setSource("EmptyText.qml", { table: screen.table });
        }
    }
    Component {
        id: firstHeader

        // qmllint disable unqualified
        NowView {
            width: list.width
            now: screen.navigation.pages.now
            onTapped: screen.navigation.open("signals")
        }
        // qmllint enable unqualified
    }
    Component {
        id: firstFooter

        // qmllint disable unqualified
        FirstScreenFooter {
            width: list.width
            navigation: screen.navigation
            source: screen.navigation.pages.freshness.source || screen.source
            flow: screen.navigation.pages.freshness.state
            condition: screen.navigation.condition
            loss: screen.navigation.loss || screen.navigation.pages.freshness.loss
        }
        // qmllint enable unqualified
    }
}
