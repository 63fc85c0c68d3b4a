import QtQuick 2.15
import Orvane.Loomkit 1.0
import "../components"

// Fetches a JSON file from a server on 127.0.0.1 that the host program
// starts for this panel (loomkit-run's `hostServer`, serving the gallery's
// own folder); nothing goes outside the machine.
Panel {
    id: panel
    title: "Network"

    property int addressCount: 0
    property url base: typeof hostServer !== "undefined" ? hostServer.serve(Qt.resolvedUrl("..")) : ""

    NetworkRequest {
        id: request
        responseType: "json"
        timeout: 5000
    }

    Component.onCompleted: {
        addressCount = Loomkit.network.addresses.length
        if (base.toString() === "")
            return
        request.open("GET", base + "data/network-sample.json")
        request.send()
    }

    Column {
        width: parent.width
        spacing: 4
        Fact { name: "Local server"; value: panel.base.toString() || "(host has no server)" }
        Fact {
            name: "Ready state"
            value: ["UNSENT", "OPENED", "SENT", "LOADING", "DONE"][request.readyState]
        }
        Fact { name: "Status"; value: request.statusText || "–" }
        Fact { name: "Content-Type"; value: request.responseHeaders["Content-Type"] || "–" }
        Fact { name: "Progress"; value: Math.round(request.progress * 100) + " %" }
        Fact { name: "Error"; value: request.errorCode ? request.errorCode + " " + request.errorText : "none" }
        Fact { name: "Greeting"; value: request.response ? request.response.greeting : "" }
        Fact { name: "Items"; value: request.response ? request.response.items.join(", ") : "" }
        Fact { name: "Proxy type"; value: Loomkit.network.proxy.type }
        Fact { name: "Addresses"; value: panel.addressCount }
    }
}
