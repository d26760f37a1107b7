import QtQuick
import Qelwatch.Ui

// The rows of a table in the look of their prototype, under section headers that stick. A key moves
// the view; new values never do. The list is not the root here: its section headers would take the
// list's own `section` for theirs.
FocusScope {
    id: table

    required property TableModel model
    required property InterfaceDescription storyboard
    readonly property alias atTop: list.atYBeginning

    ListView {
        id: list

        function goTo(row: int): void {
            if (count === 0)
                return;
            currentIndex = Math.max(0, Math.min(count - 1, row));
            positionViewAtIndex(currentIndex, ListView.Contain);
        }

        function rowsInSight(): int {
            return Math.max(1, Math.floor(height * count / contentHeight) - 1);
        }

        anchors.fill: parent
        focus: true
        activeFocusOnTab: true
        model: table.model
        delegate: table.storyboard.lookOf(table.model.cellIdentifier)
        clip: true
        reuseItems: true
        boundsBehavior: Flickable.StopAtBounds
        keyNavigationEnabled: false
        highlightFollowsCurrentItem: false

        section.property: "sectionTitle"
        section.labelPositioning: ViewSection.InlineLabels | ViewSection.CurrentLabelAtStart
        section.delegate: SectionHeader {}

        Accessible.role: Accessible.List

        Keys.onUpPressed: goTo(currentIndex - 1)
        Keys.onDownPressed: goTo(currentIndex + 1)
        Keys.onReturnPressed: table.model.choose(currentIndex)
        Keys.onEnterPressed: table.model.choose(currentIndex)
        Keys.onSpacePressed: table.model.choose(currentIndex)
        Keys.onPressed: event => {
            const steps = {
                [Qt.Key_PageUp]: -rowsInSight(),
                [Qt.Key_PageDown]: rowsInSight(),
                [Qt.Key_Home]: -count,
                [Qt.Key_End]: count
            };
            const step = steps[event.key];
            if (step === undefined)
                return;
            event.accepted = true;
            goTo(currentIndex + step);
        }
    }

    // Where in the table the view is, while it moves.
    Rectangle {
        readonly property real share: list.visibleArea.heightRatio
        readonly property real track: table.height - 4

        x: table.width - width - 2
        y: 2 + list.visibleArea.yPosition * track
        width: 3
        height: Math.max(width, share * track)
        radius: width / 2
        visible: list.moving && share < 1
        color: Theme.secondary
        opacity: 0.6
    }
}
