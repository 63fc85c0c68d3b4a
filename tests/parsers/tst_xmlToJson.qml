import QtQuick 2.15
import QtTest 1.15
import Orvane.Loomkit 1.0

TestCase {
    name: "xmlToJson"

    function test_conversion_data() {
        return [
            { tag: "attributes and repeats", xml: "<r id='7'><x>1</x><y/><x>2</x></r>", options: undefined,
              expected: { "@id": "7", "x": ["1", "2"], "y": null, "#nodes": ["x[0]", "y", "x[1]"] } },
            { tag: "root property", xml: "<ns:r>hi</ns:r>", options: { rootProperty: true },
              expected: { "r": "hi" } },
            { tag: "options", xml: "<r k='v'>t<!--c--></r>",
              options: { attributePrefix: "_", textProperty: "text", commentProperty: "note", nodesProperty: "" },
              expected: { "_k": "v", "text": "t", "note": "c" } },
            { tag: "malformed", xml: "<r>", options: undefined, expected: {} },
            { tag: "empty", xml: "", options: {}, expected: {} },
        ]
    }

    // JSON text with the keys of every object in order, so that two values
    // compare by content alone.
    function canonical(value) {
        if (Array.isArray(value) || (value !== null && typeof value === "object" && typeof value.length === "number"))
            return "[" + Array.prototype.map.call(value, canonical).join(",") + "]"
        if (value !== null && typeof value === "object")
            return "{" + Object.keys(value).sort().map(function(key) {
                return JSON.stringify(key) + ":" + canonical(value[key])
            }).join(",") + "}"
        return JSON.stringify(value)
    }

    function test_conversion(data) {
        var result = data.options === undefined ? Loomkit.xmlToJson(data.xml)
                                                 : Loomkit.xmlToJson(data.xml, data.options)
        compare(canonical(result), canonical(data.expected))
    }

    function test_nullAndOrder() {
        var result = Loomkit.xmlToJson("<r>one<b/>two<!--three--></r>")
        verify(result.b === null, "an empty element is null in script")
        compare(result["#nodes"], ["#text[0]", "b", "#text[1]", "#comment"])
        compare(result["#text"], ["one", "two"])
    }

    function test_tooDeep() {
        var xml = ""
        for (var i = 0; i < 1500; ++i)
            xml += "<a>"
        for (i = 0; i < 1500; ++i)
            xml += "</a>"
        compare(Object.keys(Loomkit.xmlToJson(xml)).length, 0)
    }
}
