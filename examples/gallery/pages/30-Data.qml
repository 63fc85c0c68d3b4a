import QtQuick 2.15
import Orvane.Loomkit 1.0
import "../components"

Panel {
    title: "Data"

    property var bytes: Loomkit.binaryData("Loomkit")
    property var id: Loomkit.uuid()

    CryptographicHash { id: hash; algorithm: CryptographicHash.Sha256 }
    LocaleInfo { id: locale; name: "de_DE" }

    // Counts the times the gallery was opened; kept in the application's store.
    Settings {
        id: store
        property int launches: 0
        Component.onCompleted: launches = launches + 1
    }

    Column {
        width: parent.width
        spacing: 4
        Fact { name: "Bytes of \"Loomkit\""; value: bytes.hex }
        Fact { name: "Base64"; value: bytes.base64 }
        Fact { name: "UInt16 at 0 (big endian)"; value: bytes.dataAt(0, BinaryData.TypeUInt16, BinaryData.BigEndian) }
        Fact { name: "SHA-256 of \"abc\""; value: hash.hash("abc") }
        Fact { name: "Version compare"; value: "1.10 vs 1.9 → " + Loomkit.compareVersionNumber("1.10", "1.9") }
        Fact { name: "UUID"; value: id.string }
        Fact { name: "UUID, 16 bytes"; value: Loomkit.binaryData(id.rfc4122).hex }
        Fact { name: "de_DE number"; value: locale.formatNumber(1234567.891, 2) }
        Fact { name: "Gallery launches"; value: store.launches }
        Fact { name: "Settings file"; value: store.path }
        Row {
            spacing: 8
            Text { text: "Digits only:"; color: "#5a6475"; font.pixelSize: 13; width: 150 }
            Rectangle {
                width: 120; height: 22; radius: 3
                border.color: entry.acceptableInput ? "#3aa36b" : "#d0504b"
                TextInput {
                    id: entry
                    anchors.fill: parent; anchors.margins: 3
                    text: "2024"
                    font.pixelSize: 13
                    validator: InputValidator { regularExpression: /[0-9]{1,6}/ }
                }
            }
        }
    }
}
