import QtQuick 2.15
import QtTest 1.15
import Orvane.Loomkit 1.0

TestCase {
    name: "Settings"

    Component {
        id: boundComponent
        Settings {
            property string userName: "guest"
            property real zoom: 1.5
            property color accent: "#336699"
        }
    }

    function init() {
        Loomkit.settings.remove("userName")
        Loomkit.settings.remove("accent")
    }

    function test_loadAndSave() {
        // The module's own type and the singleton's store share the application's settings.
        var first = createTemporaryObject(boundComponent, this)
        compare(Loomkit.settings.value("userName"), "guest")
        first.userName = "ada"
        first.accent = "#80112233"
        compare(Loomkit.settings.colorValue("accent"), "#80112233")
        first.destroy()

        var second = createTemporaryObject(boundComponent, this)
        compare(second.userName, "ada")
        compare(second.accent, "#80112233")
        compare(second.zoom, 1.5)
    }
}
