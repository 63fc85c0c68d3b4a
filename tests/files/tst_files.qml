import QtQuick 2.15
import QtTest 1.15
import Orvane.Loomkit 1.0

TestCase {
    name: "Files"

    property var work: null
    property int serial: 0

    Component {
        id: fileComponent
        File {}
    }
    Component {
        id: storageComponent
        StorageInfo {}
    }
    Component {
        id: spyComponent
        SignalSpy {}
    }
    Component {
        id: handlerComponent
        Connections {
            property var calls: []
            function onMovedFileToTrash(originalFile, pathInTrash, error) {
                calls.push([originalFile, pathInTrash, error])
            }
        }
    }

    function init() {
        serial += 1
        work = Loomkit.fileFolder(Loomkit.temporaryFolder.path + "/qml-files-" + serial)
        verify(work.makeFolder())
    }

    function cleanup() {
        verify(work.removeFolder())
    }

    function test_singletonMembers() {
        // Folders are fresh objects; the services are one each.
        verify(Loomkit.userHomeFolder !== Loomkit.userHomeFolder)
        compare(Loomkit.userHomeFolder.path, Loomkit.userHomePath)
        verify(Loomkit.temporaryFolder.exists)
        verify(Loomkit.standardPaths === Loomkit.standardPaths)
        compare(Loomkit.standardPaths.writableLocation(StandardPaths.HomeLocation), Loomkit.userHomePath)
        verify(Loomkit.environment === Loomkit.environment)
        verify(Loomkit.environment.setValue("LOOMKIT_QML_TEST", "on"))
        verify(Loomkit.environment.names.indexOf("LOOMKIT_QML_TEST") >= 0)
        verify(Loomkit.environment.remove("LOOMKIT_QML_TEST"))

        compare(Loomkit.file("~/a.txt").path, Loomkit.userHomePath + "/a.txt")
        var url = work.fileUrl("c.txt")
        compare(Loomkit.file(url).path, work.filePath("c.txt"))
        compare(Loomkit.fileInfo(url).filePath, work.filePath("c.txt"))
        compare(Loomkit.fileFolder(work.url).path, work.path)
    }

    function test_uncreatable_data() {
        return [ { tag: "Environment" }, { tag: "StandardPaths" } ]
    }

    function test_uncreatable(row) {
        try {
            Qt.createQmlObject("import Orvane.Loomkit 1.0\n" + row.tag + " {}", this)
            fail("created an uncreatable type")
        } catch (e) {
            verify(e.qmlErrors[0].message.indexOf("The Orvane type " + row.tag + " is not creatable") >= 0, e.qmlErrors[0].message)
        }
    }

    function test_scriptValues() {
        // Script arrays and option objects reach the folder as lists and maps.
        verify(work.writeTextFile("a.txt", "a"))
        verify(work.makePath("docs.txt/inner"))
        verify(work.folder("docs.txt/inner").writeTextFile("d.txt", "d"))
        compare(work.fileNames(["*.txt", "inner"], true), ["a.txt", "docs.txt/inner/d.txt"])
        compare(work.folderNames(undefined, true), ["docs.txt", "docs.txt/inner"])
        verify(work.writeFile("bin", "AAEC/w==", { decode: "base64" }))
        compare(String.fromCharCode.apply(null, Array.from(new Uint8Array(work.readFile("bin", { encode: "hex" })))), "000102ff")
    }

    function test_typesAndEnumerations() {
        // The creatable types and their enumerations reach QML.
        var file = createTemporaryObject(fileComponent, this, { path: work.filePath("stream.txt") })
        file.textEncoding = File.TextEncodingUtf16
        verify(file.open(File.OpenModeWriteOnly))
        file.writeLine("a")
        file.close()
        var info = work.fileInfo("stream.txt")
        compare(info.size, 4)
        verify(info.setPermissions(FileInfo.ReadOwner | FileInfo.WriteOwner))
        compare(info.permissions & 0x7077, FileInfo.ReadOwner | FileInfo.WriteOwner)
        var storage = createTemporaryObject(storageComponent, this, { path: "/no/such/place" })
        compare(storage.storageType, StorageInfo.StorageTypeNoRoot)
    }

    function test_trashAsync() {
        // Script handlers get all three arguments, whether connected or declared.
        verify(work.writeTextFile("trash-me.txt", "t"))
        var received = []
        var handler = function (originalFile, pathInTrash, error) { received.push([originalFile, pathInTrash, error]) }
        work.movedFileToTrash.connect(handler)
        var spy = createTemporaryObject(spyComponent, this, { target: work, signalName: "movedFileToTrash" })
        var connections = createTemporaryObject(handlerComponent, this, { target: work })

        work.moveFileToTrashAsync("trash-me.txt")
        spy.wait(5000)
        compare(received[0][0], "trash-me.txt")
        verify(received[0][1].indexOf("/Trash/files/") > 0, received[0][1])
        compare(received[0][2], "")
        work.moveFileToTrashAsync("trash-me.txt")
        spy.wait(5000)
        verify(received[1][1] === undefined)
        compare(received[1][2], "File does not exist.")
        compare(connections.calls, received)
        work.movedFileToTrash.disconnect(handler)
    }
}
