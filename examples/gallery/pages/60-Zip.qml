import QtQuick 2.15
import Orvane.Loomkit 1.0
import "../components"

// Writes a small archive of the gallery's own files with ZipWriter, then
// lists and extracts it with ZipReader.
Panel {
    id: panel
    title: "Zip"

    property string folder: Loomkit.resolvedPath("$TEMP")
    property bool ready: false
    property int added: 0
    property int progressReports: 0
    property bool extracted: false
    property var entry: null

    ZipWriter { id: writer }

    ZipReader {
        id: reader
        onProgress: panel.progressReports++
        onCompleted: panel.extracted = true
        onError: console.warn("zip error", fileName, result)
    }

    Column {
        width: parent.width
        spacing: 4
        Fact { name: "Archive"; value: writer.path }
        Fact { name: "Files added"; value: panel.added }
        Fact { name: "fileNames"; value: panel.ready ? reader.fileNames.join(", ") : "" }
        Fact { name: "folderNames"; value: panel.ready ? reader.folderNames.join(", ") : "" }
        Fact { name: "exists(\"PAGES/60-ZIP.QML\")"; value: panel.ready && reader.exists("PAGES/60-ZIP.QML") }
        Fact { name: "60-Zip.qml size"; value: panel.entry ? panel.entry.size + " → " + panel.entry.compressedSize + " bytes" : "" }
        Fact { name: "CRC-32"; value: panel.entry ? Number(panel.entry.crc).toString(16) : "" }
        Fact { name: "Modified"; value: panel.entry ? panel.entry.lastModified.toLocaleString(Qt.locale(), Locale.ShortFormat) : "" }
        Fact { name: "Extracted to"; value: panel.extracted ? panel.folder + "/loomkit-gallery-zip" : "(not yet)" }
        Fact { name: "Progress reports"; value: panel.progressReports }
        Fact { name: "First line"; value: panel.ready ? reader.readTextFile("components/Fact.qml").split("\n")[0] : "" }
    }

    Component.onCompleted: {
        var root = String(Qt.resolvedUrl("..")).replace(/^file:\/\//, "").replace(/\/$/, "")
        var files = ["main.qml", "pages/60-Zip.qml", "pages/10-System.qml", "components/Panel.qml", "components/Fact.qml"]
        writer.path = folder + "/loomkit-gallery-demo.zip"
        for (var i = 0; i < files.length; ++i) {
            // The first call starts a new archive, the others add to it.
            if (writer.addFile(root + "/" + files[i], files[i], "", i > 0))
                added++
        }
        reader.path = writer.path
        entry = reader.fileInfo("pages/60-Zip.qml")
        reader.extractAll(folder + "/loomkit-gallery-zip")
        ready = true
    }
}
