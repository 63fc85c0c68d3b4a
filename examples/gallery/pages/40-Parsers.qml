import QtQuick 2.15
import Orvane.Loomkit 1.0
import "../components"

Panel {
    title: "Parsers"

    readonly property string sample: "<catalog version=\"2\">"
        + "<book id=\"b1\"><title>Loom patterns</title><price currency=\"EUR\">12.50</price></book>"
        + "<!-- out of print -->"
        + "<book id=\"b2\"><title>Warp &amp; weft</title></book>"
        + "<note><![CDATA[<b>raw</b>]]></note>"
        + "</catalog>"
    readonly property var result: Loomkit.xmlToJson(sample)

    Column {
        width: parent.width
        spacing: 4
        Fact { name: "Books"; value: result.book.length }
        Fact { name: "book[0].@id"; value: result.book[0]["@id"] }
        Fact { name: "book[0].price"; value: result.book[0].price["#text"] + " " + result.book[0].price["@currency"] }
        Fact { name: "book[1].title"; value: result.book[1].title }
        Fact { name: "#comment"; value: result["#comment"] }
        Fact { name: "#cdata of note"; value: result.note["#cdata"] }
        Fact { name: "#nodes"; value: result["#nodes"].join(", ") }
        Fact { name: "@version"; value: result["@version"] }
        Fact { name: "Too deep (1500 levels)"; value: Object.keys(Loomkit.xmlToJson("<a>".repeat(1500) + "</a>".repeat(1500))).length + " keys" }
        Text {
            width: parent.width
            wrapMode: Text.WrapAnywhere
            font.family: "monospace"
            font.pixelSize: 11
            color: "#1c2333"
            text: JSON.stringify(result, null, 1)
            maximumLineCount: 14
            elide: Text.ElideRight
        }
    }
}
