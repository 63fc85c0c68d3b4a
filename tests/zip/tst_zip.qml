import QtQuick 2.15
import QtTest 1.15
import Orvane.Loomkit 1.0

TestCase {
    name: "Zip"

    Component { id: writerComponent; ZipWriter {} }
    Component { id: readerComponent; ZipReader {} }
    SignalSpy { id: completedSpy; signalName: "completed" }
    SignalSpy { id: progressSpy; signalName: "progress" }

    function test_writeListExtract() {
        var png = Loomkit.resolvedPath("$LOOMKIT_TEST_DATA/zip/gophercolor16x16.png")
        var readme = Loomkit.resolvedPath("$LOOMKIT_TEST_DATA/zip/README.md")
        var writer = createTemporaryObject(writerComponent, this)
        writer.path = "$TMPDIR/qml-zip-test.zip"
        verify(writer.path.indexOf("$") < 0)
        verify(writer.addFile(png, "images/gopher.png", "", false))
        verify(writer.addFile(readme, "README.md"))
        verify(!writer.addFile(readme + ".missing"))

        var reader = createTemporaryObject(readerComponent, this)
        reader.path = writer.path
        compare(reader.isOpen, false)
        compare(reader.fileNames, ["images/gopher.png", "README.md"])
        compare(reader.folderNames, ["images", "."])
        compare(reader.isOpen, true)
        reader.caseSensitive = true
        verify(!reader.exists("IMAGES/GOPHER.PNG"))

        var info = reader.fileInfo("images/gopher.png")
        compare([info.fileName, info.suffix, info.path, info.size], ["gopher.png", "png", "images", 785])
        verify(info.lastModified instanceof Date)
        verify(reader.readTextFile("README.md").indexOf("Zip samples") >= 0)
        compare(Object.keys(reader.readJsonFile("README.md")).length, 0)

        completedSpy.target = reader
        progressSpy.target = reader
        var out = Loomkit.resolvedPath("$TMPDIR") + "/qml-zip-out"
        verify(reader.extractAll(out))
        compare(completedSpy.count, 1)
        compare(progressSpy.count, 4)
        compare(progressSpy.signalArguments[1][2], 100)
        verify(reader.extractAll(out, "images"))
        compare(completedSpy.count, 2)
        compare(ZipReader.CrcError, -105)
    }

    function test_fileInfoIsCreatable() {
        var info = Qt.createQmlObject("import Orvane.Loomkit 1.0; ZipFileInfo {}", this)
        compare(info.filePath, "")
        info.destroy()
    }
}
