import QtQuick
import Qelwatch.Ui

// The rows of a table in the look of their prototype, under section headers that stick. A key moves
// the view; new values never do. The list is not the root here: its section headers would take the
// list's own `section` for theirs. Nor has it the keys itself: what stands above and below its rows
// has its own.
FocusScope {
    id: table

    required property TableModel model
    required property InterfaceDescription storyboard
    readonly property alias atTop: list.atYBeginning
    property Component header: null
    property Component footer: null

    ListKeys {
        id: keys
        anchors.fill: parent
        focus: true
        list: list
        onChosen: row => table.model.choose(row)
    }
    RowList {
        id: list
        anchors.fill: parent
        keysHere: keys.activeFocus
        model: table.model
        delegate: table.storyboard.lookOf(table.model.cellIdentifier)
        header: table.header
        footer: table.footer
        clip: true
        reuseItems: true
        boundsBehavior: Flickable.StopAtBounds
        keyNavigationEnabled: false
        highlightFollowsCurrentItem: false

        section.property: "sectionTitle"
        section.labelPositioning: ViewSection.InlineLabels | ViewSection.CurrentLabelAtStart
        section.delegate: SectionHeader {}

        Accessible.role: Accessible.List
        Accessible.name: table.model.title
    }
    ListPlace {
        list: list
    }
    // What stands above the rows may grow: who is at the top stays there.
    Connections {
        target: list.headerItem

        function onHeightChanged(): void {
            if (!list.scrolledAway && list.currentIndex <= 0)
                list.positionViewAtBeginning();
        }
    }
}
