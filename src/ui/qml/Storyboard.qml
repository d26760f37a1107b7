import QtQuick
import Qelwatch.Ui

// Which screen comes first, how each cell looks and which screen it opens.
InterfaceDescription {
    initialScreen: "QelViewController"
    initialTitle: Application.displayName

    CellPrototype {
        identifier: "LaunchView"
        opens: "FirstLevelViewController"
        look: Qt.resolvedUrl("LaunchView.qml")
    }
    CellPrototype {
        identifier: "FirstClickView"
        opens: "SecondLevelViewController"
        look: Qt.resolvedUrl("FirstClickView.qml")
    }
    CellPrototype {
        identifier: "SecondClickView"
        look: Qt.resolvedUrl("SecondClickView.qml")
    }
    CellPrototype {
        identifier: "ThirdClickView"
        look: Qt.resolvedUrl("ThirdClickView.qml")
    }
}
