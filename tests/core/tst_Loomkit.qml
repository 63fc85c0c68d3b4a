import QtQuick 2.15
import QtTest 1.15
import Orvane.Loomkit 1.0

TestCase {
    name: "Loomkit"
    when: windowShown
    width: 200
    height: 200

    Rectangle { id: rectangle; width: 10; height: 10 }
    Item { id: plainItem }
    TextInput { id: input; width: 100; height: 20 }
    SignalSpy { id: scaleSpy; target: Loomkit; signalName: "displayScaleFactorChanged" }
    SignalSpy { id: importSpy; target: Loomkit; signalName: "importPathListChanged" }
    SignalSpy { id: homeSpy; target: Loomkit; signalName: "userHomePathChanged" }

    function test_versionsAndSystem() {
        compare(Loomkit.osName, "Linux")
        var info = Loomkit.systemInformation
        for (var key of ["model", "manufacturer", "family"])
            verify(info.hasOwnProperty(key), key)
        verify(info.linuxNumberOfProcessors >= 1)
        verify(Loomkit.availableLocaleNames.indexOf("de_DE") >= 0)
    }

    function test_typeOf_data() {
        return [
            { tag: "int", value: 1, expected: "int" },
            { tag: "double", value: 1.5, expected: "double" },
            { tag: "array", value: [1], expected: "array" },
            { tag: "string", value: "x", expected: "string" },
            { tag: "bool", value: true, expected: "bool" },
            { tag: "object", value: { a: 1 }, expected: "object" },
            { tag: "null", value: null, expected: "null" },
            { tag: "undefined", value: undefined, expected: "undefined" },
            { tag: "date", value: new Date(), expected: "date" },
            { tag: "color", value: Qt.rgba(1, 0, 0, 1), expected: "color" },
            { tag: "point", value: Qt.point(1, 2), expected: "point" },
            { tag: "rect", value: Qt.rect(1, 2, 3, 4), expected: "rect" },
            { tag: "size", value: Qt.size(1, 2), expected: "size" },
            { tag: "vector3d", value: Qt.vector3d(1, 2, 3), expected: "vector3d" },
            { tag: "url", value: Loomkit.resolvedPathUrl("/x"), expected: "url" },
            { tag: "function", value: function() {}, expected: "function" }
        ]
    }

    function test_typeOf(row) {
        compare(Loomkit.typeOf(row.value), row.expected)
    }

    function test_typeOfObjects() {
        compare(Loomkit.typeOf(rectangle, true), "Rectangle")
        verify(Loomkit.typeOf(rectangle).indexOf("QQuickRectangle") === 0)
        compare(Loomkit.typeOf(plainItem, true), "Item")
        compare(Loomkit.typeOf(Loomkit), "Loomkit")
        compare(Loomkit.objectToString(Loomkit), "")
        compare(Loomkit.objectToString(null), "null")
    }

    function test_instanceOf() {
        verify(Loomkit.instanceOf(rectangle, "QQuickItem"))
        verify(!Loomkit.instanceOf(rectangle, "QQuickText"))
        verify(Loomkit.instanceOf(1, "int"))
        verify(Loomkit.instanceOf(2, 3))
        verify(!Loomkit.instanceOf("x", "int"))
        verify(!Loomkit.instanceOf(rectangle, ""))
        // A type given as an object means that object's class.
        verify(Loomkit.instanceOf(rectangle, plainItem))
        verify(!Loomkit.instanceOf(plainItem, rectangle))
    }

    function test_contrastColor() {
        compare(Loomkit.contrastColor("#808080"), Qt.rgba(1, 1, 1, 1))
        compare(Loomkit.contrastColor("#818181"), Qt.rgba(0, 0, 0, 1))
        compare(Loomkit.contrastColor("#000000", "#ff0000"), Qt.rgba(1, 0, 0, 1))
        compare(Loomkit.contrastColor("#000000", "#00ff0000"), Qt.rgba(1, 1, 1, 1))
        var mixed = Loomkit.contrastColor("#000000", Qt.rgba(1, 0, 0, 0.5))
        fuzzyCompare(mixed.r, 1, 0.01)
        fuzzyCompare(mixed.g, 0.5, 0.01)
        fuzzyCompare(mixed.a, 1, 0.01)
        var faded = Loomkit.alphaColor("red", 0.25)
        fuzzyCompare(faded.a, 0.25, 0.01)
        compare(faded.r, 1)
    }

    function test_displayScaleFactor() {
        var initial = Loomkit.displayScaleFactor
        verify(initial > 0)
        scaleSpy.clear()
        Loomkit.displayScaleFactor = 2
        compare(Loomkit.displayScaleFactor, 2)
        compare(scaleSpy.count, 1)
        Loomkit.displayScaleFactor = 2
        compare(scaleSpy.count, 2) // notifies even without a change
        Loomkit.displayScaleFactor = -1
        compare(Loomkit.displayScaleFactor, initial)
        compare(scaleSpy.count, 3)
    }

    function test_importPaths() {
        var before = Loomkit.importPathList
        importSpy.clear()
        Loomkit.removeImportPath("/no/such/import/path")
        compare(importSpy.count, 0)
        // The engine keeps only folders that exist, by their canonical path.
        var folder = testDataFolder
        Loomkit.addImportPath(folder)
        compare(importSpy.count, 1)
        verify(Loomkit.importPathList.indexOf(folder) >= 0, Loomkit.importPathList)
        Loomkit.removeImportPath(folder)
        compare(importSpy.count, 2)
        verify(Loomkit.importPathList.indexOf(folder) < 0)
        compare(Loomkit.importPathList.length, before.length)
    }

    function test_paths() {
        Loomkit.setPathVariable("LOOMKIT_QML", "/opt/qml")
        compare(Loomkit.pathVariable("LOOMKIT_QML"), "/opt/qml")
        compare(Loomkit.resolvedPath("$LOOMKIT_QML/a"), "/opt/qml/a")
        compare(Loomkit.resolvedPathUrl("$LOOMKIT_QML/a"), "file:///opt/qml/a")
        compare(Loomkit.resolvedUrl("http://example.com/x?y#z"), "http://example.com/x?y#z")
        compare(Loomkit.resolvedUrl("relative/thing"), "relative/thing")

        homeSpy.clear()
        var home = Loomkit.userHomePath
        verify(home.length > 0)
        Loomkit.userHomePath = home
        compare(homeSpy.count, 0)
        Loomkit.userHomePath = "/srv/home"
        compare(homeSpy.count, 1)
        compare(Loomkit.resolvedPath("~/x"), "/srv/home/x")
        Loomkit.userHomePath = home
    }

    function test_ids() {
        ignoreWarning(/Loomkit.createId\(\) will be deprecated/)
        verify(/^[0-9a-f]{32}$/.test(Loomkit.createId()))
        var forms = [/^\{[0-9a-f-]{36}\}$/, /^[0-9a-f-]{36}$/, /^[0-9a-f]{32}$/]
        for (var i = 0; i < forms.length; ++i) {
            ignoreWarning(/Loomkit.createUuidString\(\) will be deprecated/)
            var id = i === 0 ? Loomkit.createUuidString() : Loomkit.createUuidString(i)
            verify(forms[i].test(id), id)
        }
    }

    function test_sendKey() {
        input.text = ""
        input.forceActiveFocus()
        Loomkit.sendKey("ab", input)
        compare(input.text, "ab")
        Loomkit.sendKey({ key: Qt.Key_Backspace }, input)
        compare(input.text, "a")
        Loomkit.sendKey(["c", { key: Qt.Key_D, text: "d" }], input)
        compare(input.text, "acd")
        Loomkit.sendKey(null, input)
        compare(input.text, "acd")
        Loomkit.sendStandardKey(StandardKey.SelectAll, input)
        compare(input.selectedText, "acd")
        Loomkit.sendKey("x") // goes to the focused item
        compare(input.text, "x")
    }

    function test_loadTranslator() {
        var calls = testTranslatorManager.calls
        Loomkit.loadTranslator(["MyApp"], "/apps/one", "fr")
        compare(testTranslatorManager.calls, calls + 1)
        compare(testTranslatorManager.lastFolder, "/apps/one")
        compare(testTranslatorManager.lastLocale, "fr")
        compare(testTranslatorManager.lastTranslations, ["MyApp"])
    }

    function test_grabWindow() {
        var path = Loomkit.resolvedPath("$TEMP") + "/loomkit-grab-test.png"
        verify(Loomkit.grabWindowToFile(path))
        verify(Loomkit.grabWindowToFile(path, Qt.rect(0, 0, 5, 5)))
    }
}
