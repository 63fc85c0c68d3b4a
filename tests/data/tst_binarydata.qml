import QtQuick 2.15
import QtTest 1.15
import Orvane.Loomkit 1.0

TestCase {
    name: "BinaryData"

    Component { id: dataComponent; BinaryData {} }

    function test_factory_data() {
        return [
            { tag: "array buffer", value: new Uint8Array([1, 2, 250]).buffer, hex: "0102fa" },
            { tag: "text as utf-8", value: "\u00e9", hex: "c3a9" },
            { tag: "nothing", value: undefined, hex: "" },
        ]
    }

    function test_factory(data) {
        var bytes = Loomkit.binaryData(data.value)
        compare(bytes.hex, data.hex)
        compare(bytes.size, data.hex.length / 2)
        compare(Loomkit.typeOf(bytes), "BinaryData")
    }

    function test_typedAccess() {
        var bytes = createTemporaryObject(dataComponent, this)
        compare(bytes.setDataAt(0, 0x1234, BinaryData.TypeUInt16, BinaryData.BigEndian), 2)
        compare(bytes.dataAt(0, BinaryData.TypeUInt16), 0x3412) // little-endian by default
        compare(bytes.dataAt(1, BinaryData.TypeUInt16), undefined)
    }

    function test_views() {
        var bytes = createTemporaryObject(dataComponent, this, { base64: "TWFu" })
        compare(bytes.stringData(), "Man")
        compare(new Uint8Array(bytes.data)[0], 77)
        compare(bytes.data.byteLength, 3)
        // The object's own encoding drives strings given as data.
        bytes.textEncoding = BinaryData.TextEncodingUtf16
        bytes.data = "A"
        compare(bytes.hex, "4100")
        bytes.hex = "ff00"
        compare(bytes.base64, "/wA=")
    }
}
