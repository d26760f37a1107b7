import QtQuick
import Qelwatch.Ui

// The keys of a list: they move its current row and choose it.
Item {
    id: keys

    required property ListView list

    signal chosen(row: int)

    function goTo(row: int): void {
        if (list.count === 0)
            return;
        list.currentIndex = Math.max(0, Math.min(list.count - 1, row));
        list.positionViewAtIndex(list.currentIndex, ListView.Contain);
    }

    function rowsInSight(): int {
        return Math.max(1, Math.floor(list.height * list.count / list.contentHeight) - 1);
    }

    function announce(): void {
        if (activeFocus)
            ScreenReader.enter(list.currentItem);
    }

    activeFocusOnTab: true
    onActiveFocusChanged: announce()

    Keys.onUpPressed: goTo(list.currentIndex - 1)
    Keys.onDownPressed: goTo(list.currentIndex + 1)
    Keys.onReturnPressed: chosen(list.currentIndex)
    Keys.onEnterPressed: chosen(list.currentIndex)
    Keys.onSpacePressed: chosen(list.currentIndex)
    Keys.onPressed: event => {
        const steps = {
            [Qt.Key_PageUp]: -rowsInSight(),
            [Qt.Key_PageDown]: rowsInSight(),
            [Qt.Key_Home]: -list.count,
            [Qt.Key_End]: list.count
        };
        const step = steps[event.key];
        if (step === undefined)
            return;
        event.accepted = true;
        goTo(list.currentIndex + step);
    }

    Connections {
        target: keys.list

        function onCurrentItemChanged(): void {
            keys.announce();
        }
    }
}
