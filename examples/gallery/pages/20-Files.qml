import QtQuick 2.15
import Orvane.Loomkit 1.0
import "../components"

Panel {
    title: "Files and storage"

    // The gallery's own folder; the filters also pick the sub-folders entered.
    FileFolder { id: gallery; url: Qt.resolvedUrl("..") }
    // This panel's own file.
    FileInfo { id: info; url: Qt.resolvedUrl("20-Files.qml") }
    // The volume that holds the home folder.
    StorageInfo { id: home; path: Loomkit.userHomePath }

    function gigabytes(bytes) {
        return (bytes / 1073741824).toFixed(1) + " GB"
    }

    // Owner, group and others, as ls shows them.
    function modeText(permissions) {
        var text = ""
        var shifts = [12, 4, 0]
        for (var i = 0; i < shifts.length; ++i) {
            var bits = (permissions >> shifts[i]) & 7
            text += (bits & 4 ? "r" : "-") + (bits & 2 ? "w" : "-") + (bits & 1 ? "x" : "-")
        }
        return text
    }

    function storageTypeName(type) {
        return ["unknown", "no root", "removable", "fixed", "remote", "optical", "RAM"][type] || "?"
    }

    Column {
        width: parent.width
        spacing: 4

        Text { text: "Folder " + gallery.folderName + " (" + gallery.size + " bytes)"; font.bold: true; font.pixelSize: 13; color: "#2b3a55" }
        Repeater {
            // Reading path makes the listing follow the folder.
            model: gallery.path ? gallery.fileNames(["*.qml", "components", "pages"], true) : []
            Text { text: "  " + modelData; font.pixelSize: 13; color: "#1c2333" }
        }
        Fact { name: "Sub-folders"; value: gallery.path ? gallery.folderNames(undefined, true).join(", ") : "" }

        Text { text: "File " + info.fileName; font.bold: true; font.pixelSize: 13; color: "#2b3a55"; topPadding: 6 }
        Fact { name: "Type"; value: info.type }
        Fact { name: "Size"; value: info.size + " bytes" }
        Fact { name: "Modified"; value: Qt.formatDateTime(info.lastModified, "yyyy-MM-dd hh:mm") }
        Fact { name: "Permissions"; value: modeText(info.permissions) }
        Fact { name: "In folder"; value: info.folder.folderName }

        Text { text: "Home volume"; font.bold: true; font.pixelSize: 13; color: "#2b3a55"; topPadding: 6 }
        Fact { name: "Mounted at"; value: home.rootPath + " (" + home.fileSystemType + ")" }
        Fact { name: "Device"; value: home.device }
        Fact { name: "Kind"; value: storageTypeName(home.storageType) + (home.isReadOnly ? ", read-only" : "") }
        Fact { name: "Available"; value: gigabytes(home.bytesAvailable) + " of " + gigabytes(home.bytesTotal) }
        Fact { name: "Volumes mounted"; value: home.mountedVolumes.length }
        Fact { name: "Documents"; value: Loomkit.standardPaths.writableLocation(StandardPaths.DocumentsLocation) }
    }
}
