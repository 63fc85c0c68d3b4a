// The Loomkit gallery: one panel per area of the module. Each file in pages/
// is a panel; they are laid out in name order.
import QtQuick 2.15
import QtQuick.Window 2.15
import Qt.labs.folderlistmodel 2.15

Window {
    id: window
    width: 1280
    height: 1560
    visible: true
    color: "#eef1f5"
    title: qsTr("Loomkit gallery")

    Rectangle {
        id: header
        width: parent.width
        height: 56
        color: "#2b3a55"
        Text {
            anchors.verticalCenter: parent.verticalCenter
            x: 20
            text: "Orvane.Loomkit gallery"
            color: "white"
            font.pixelSize: 22
            font.bold: true
        }
    }

    FolderListModel {
        id: pages
        folder: Qt.resolvedUrl("pages")
        nameFilters: ["*.qml"]
        sortField: FolderListModel.Name
        showDirs: false
    }

    Flickable {
        anchors { top: header.bottom; left: parent.left; right: parent.right; bottom: parent.bottom; margins: 12 }
        contentHeight: flow.height
        clip: true

        Flow {
            id: flow
            width: parent.width
            spacing: 12

            Repeater {
                model: pages
                delegate: Loader {
                    source: fileUrl
                    width: (flow.width - flow.spacing * 2) / 3
                }
            }
        }
    }
}
