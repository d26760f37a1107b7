import QtQuick
import QtQuick.Controls.Basic
import Qelwatch.Ui

// The rows of a table in the look of their prototype, under section headers that stick. A key moves
// the view; new values never do.
ListView {
    id: list

    required property TableModel table
    required property InterfaceDescription storyboard

    function goTo(row: int): void {
        if (count === 0)
            return;
        currentIndex = Math.max(0, Math.min(count - 1, row));
        positionViewAtIndex(currentIndex, ListView.Contain);
    }

    function rowsInSight(): int {
        return Math.max(1, Math.floor(height / (contentHeight / Math.max(1, count))) - 1);
    }

    model: table
    delegate: storyboard.lookOf(table.cellIdentifier)
    clip: true
    reuseItems: true
    boundsBehavior: Flickable.StopAtBounds
    keyNavigationEnabled: false
    highlightFollowsCurrentItem: false
    currentIndex: 0

    section.property: "sectionTitle"
    section.labelPositioning: ViewSection.InlineLabels | ViewSection.CurrentLabelAtStart
    section.delegate: SectionHeader {}

    ScrollIndicator.vertical: ScrollIndicator {
        contentItem: Rectangle {
            implicitWidth: 3
            radius: 1.5
            color: Theme.secondary
            opacity: list.moving ? 0.6 : 0
        }
    }

    Accessible.role: Accessible.List

    Keys.onUpPressed: goTo(currentIndex - 1)
    Keys.onDownPressed: goTo(currentIndex + 1)
    Keys.onReturnPressed: table.choose(currentIndex)
    Keys.onEnterPressed: table.choose(currentIndex)
    Keys.onSpacePressed: table.choose(currentIndex)
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
