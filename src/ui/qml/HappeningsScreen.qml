import QtQuick
import Qelwatch.Ui

// What happened, newest first, under days that stick.
Screen {
    id: screen

    readonly property HappeningsModel happenings: navigation.pages.happenings

    atTop: list.atYBeginning

    KindFilter {
        id: filter
        width: parent.width
        height: visible ? implicitHeight : 0
        visible: count > 1
        happenings: screen.happenings
    }
    ListKeys {
        id: keys
        anchors.fill: list
        focus: true
        list: list
    }
    RowList {
        id: list
        anchors {
            top: filter.bottom
            bottom: parent.bottom
            left: parent.left
            right: parent.right
        }
        keysHere: keys.activeFocus
        model: screen.happenings.rows
        delegate: HappeningRow {}
        clip: true
        boundsBehavior: Flickable.StopAtBounds
        keyNavigationEnabled: false
        highlightFollowsCurrentItem: false
        section.property: "section"
        section.labelPositioning: ViewSection.InlineLabels | ViewSection.CurrentLabelAtStart
        section.delegate: SectionHeader {}
        footer: older
        Accessible.role: Accessible.List
        Accessible.name: screen.title

        Component {
            id: older

            // qmllint disable unqualified
            NothingYet {
                x: Theme.inset(list.width)
                width: list.width - 2 * x
                topPadding: Theme.margin
                bottomPadding: Theme.margin
                text: screen.happenings.notice || screen.happenings.older
            }
            // qmllint enable unqualified
        }
    }
    ListPlace {
        list: list
    }
}
