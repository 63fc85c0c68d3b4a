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

    function bytesToText(buffer) {
        var view = new Uint8Array(buffer)
        var text = ""
        for (var i = 0; i < view.length; ++i)
            text += String.fromCharCode(view[i])
        return text
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
        return [
            { tag: "Environment", message: "The Orvane type Environment is not creatable" },
            { tag: "StandardPaths", message: "The Orvane type StandardPaths is not creatable" }
        ]
    }

    function test_uncreatable(data) {
        var failed = false
        try {
            Qt.createQmlObject("import Orvane.Loomkit 1.0\n" + data.tag + " {}", this)
        } catch (error) {
            failed = true
            verify(error.qmlErrors[0].message.indexOf(data.message) >= 0, error.qmlErrors[0].message)
        }
        verify(failed)
    }

    function test_scriptValues() {
        // Script arrays and objects reach the folder as lists and maps.
        verify(work.writeTextFile("a.txt", "a"))
        verify(work.makePath("docs.txt/inner"))
        verify(work.folder("docs.txt/inner").writeTextFile("d.txt", "d"))
        compare(work.fileNames(["*.txt", "inner"], true), ["a.txt", "docs.txt/inner/d.txt"])
        compare(work.folderNames(undefined, true), ["docs.txt", "docs.txt/inner"])

        verify(work.writeFile("bin", "AAEC/w==", { decode: "base64" }))
        compare(bytesToText(work.readFile("bin", { encode: "hex" })), "000102ff")
        verify(work.writeJsonFile("j.json", { name: "x", list: [1, 2] }))
        compare(work.readJsonFile("j.json").list, [1, 2])
        verify(!work.writeTextFile("missing/t.txt", "t"))

        // A CSV error is raised in the script.
        var message = ""
        try {
            work.readCsvFile("none.csv")
        } catch (error) {
            message = error.message
        }
        compare(message, "Error reading CSV file:Open QIODevice failed.")
    }

    function test_fileStream() {
        // The enumerations reach QML, and a file info keeps one folder.
        var file = createTemporaryObject(fileComponent, this, { path: work.filePath("stream.txt") })
        file.textEncoding = File.TextEncodingUtf16
        verify(file.open(File.OpenModeWriteOnly))
        file.writeLine("a")
        file.close()
        var info = work.fileInfo("stream.txt")
        compare(info.size, 4)
        verify(info.folder === info.folder)
        verify(info.setPermissions(FileInfo.ReadOwner | FileInfo.WriteOwner))
        compare(info.permissions & 0x7077, FileInfo.ReadOwner | FileInfo.WriteOwner)
    }

    function test_trashAsync() {
        verify(work.writeTextFile("trash-me.txt", "t"))
        var received = []
        var handler = function (originalFile, pathInTrash, error) {
            received.push({ originalFile: originalFile, pathInTrash: pathInTrash, error: error })
        }
        work.movedFileToTrash.connect(handler)
        var spy = createTemporaryObject(spyComponent, this, { target: work, signalName: "movedFileToTrash" })
        var connections = createTemporaryObject(handlerComponent, this, { target: work })

        work.moveFileToTrashAsync("trash-me.txt")
        compare(received.length, 0)
        spy.wait(5000)
        compare(received[0].originalFile, "trash-me.txt")
        verify(received[0].pathInTrash.indexOf("/Trash/files/") > 0, received[0].pathInTrash)
        compare(received[0].error, "")
        verify(!work.fileExists("trash-me.txt"))
        verify(Loomkit.fileInfo(received[0].pathInTrash).exists)

        work.moveFileToTrashAsync("trash-me.txt")
        spy.wait(5000)
        compare(received[1].error, "File does not exist.")
        verify(received[1].pathInTrash === undefined)
        // A Connections handler gets all three arguments too.
        compare(connections.calls.length, 2)
        compare(connections.calls[0][1], received[0].pathInTrash)
        compare(connections.calls[1][2], "File does not exist.")
        work.movedFileToTrash.disconnect(handler)
    }

    function test_storage() {
        var storage = createTemporaryObject(storageComponent, this, { path: "~" })
        verify(storage.isValid)
        verify(storage.bytesTotal > 0 && storage.bytesAvailable <= storage.bytesTotal)
        verify(storage.mountedVolumes.length > 0)
        storage.path = "/no/such/place"
        verify(!storage.isValid)
        compare(storage.storageType, StorageInfo.StorageTypeNoRoot)
    }
}
