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

    function test_blankKeepsDeclared() {
        Loomkit.settings.setValue("userName", "  ")
        verify(!Loomkit.settings.contains("userName"))
        compare(createTemporaryObject(boundComponent, this).userName, "guest")
    }

    function test_typedSurface() {
        var settings = Loomkit.settings
        settings.setValue("qml/a", 1, 1)
        verify(!settings.contains("qml/a"))
        settings.setValue("qml/a", 2, 1)
        compare(settings.numberValue("qml/a"), 2)
        compare(settings.value("qml/missing", 5), 5)
        verify(settings.boolValue("qml/missing", true))
        settings.setColorValue("qml/c", Qt.rgba(1, 0, 0, 1))
        compare(settings.value("qml/c"), "#ff0000")
    }
}
