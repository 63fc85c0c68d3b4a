// A titled card that holds one demo.
import QtQuick 2.15

Rectangle {
    id: panel
    property string title
    default property alias content: body.data
    radius: 8
    color: "white"
    border.color: "#d5dae3"
    implicitHeight: body.childrenRect.height + 56

    Text {
        id: heading
        x: 14; y: 12
        text: panel.title
        font.pixelSize: 16
        font.bold: true
        color: "#2b3a55"
    }
    Item {
        id: body
        anchors { top: heading.bottom; left: parent.left; right: parent.right; margins: 14 }
        anchors.topMargin: 10
    }
}
