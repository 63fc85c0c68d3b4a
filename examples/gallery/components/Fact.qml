// One "name: value" line of a panel.
import QtQuick 2.15

Row {
    property string name
    property var value
    spacing: 8
    Text { text: name; color: "#5a6475"; font.pixelSize: 13; width: 150; elide: Text.ElideRight }
    Text { text: value === undefined ? "" : String(value); color: "#1c2333"; font.pixelSize: 13; width: 220; elide: Text.ElideRight }
}
