import QtQuick
import Qelwatch.Ui

// Which screen comes first, how each cell looks and which screen it opens.
InterfaceDescription {
    initialScreen: "QelViewController"
    initialTitle: Application.displayName

    CellPrototype {
        identifier: "LaunchView"
        opens: "FirstLevelViewController"
        look: Component {
            LaunchView {}
        }
    }
    CellPrototype {
        identifier: "FirstClickView"
        opens: "SecondLevelViewController"
        look: Component {
            FirstClickView {}
        }
    }
    CellPrototype {
        identifier: "SecondClickView"
        look: Component {
            SecondClickView {}
        }
    }
    CellPrototype {
        identifier: "ThirdClickView"
        look: Component {
            ThirdClickView {}
        }
    }
}
