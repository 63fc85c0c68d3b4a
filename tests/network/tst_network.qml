import QtQuick 2.15
import QtTest 1.15
import Orvane.Loomkit 1.0

TestCase {
    id: testCase
    name: "NetworkQml"

    Component {
        id: requestComponent
        NetworkRequest {}
    }

    SignalSpy { id: timeoutSpy; signalName: "timeout" }

    function waitDone(request) {
        tryCompare(request, "readyState", NetworkRequest.ReadyStateComplete, 10000)
    }

    function test_registration() {
        verify(Loomkit.network !== null)
        verify(Loomkit.network.proxy.type !== undefined)
        compare(NetworkRequest.DONE, NetworkRequest.ReadyStateComplete)
        compare(NetworkProxy.HttpProxy, 3)
        compare(Network.ConfigurationStateActive, 14)
        var set = createTemporaryQmlObject("import Orvane.Loomkit 1.0; PropertySet {}", testCase)
        set.setValue("k", "v")
        compare(set.replaceVariables("<${k}>"), "<v>")
        var failed = false
        try {
            Qt.createQmlObject("import Orvane.Loomkit 1.0; Network {}", testCase)
        } catch (e) {
            failed = e.qmlErrors[0].message === "The Orvane type Network is not creatable"
        }
        verify(failed)
    }

    function test_scriptObjectBodyAndHeaders() {
        var request = createTemporaryObject(requestComponent, testCase, { responseType: "json" })
        request.headers.referrer = "http://from.example/"
        request.headers["X-Custom"] = "custom value"
        request.open("post", testHttpServer.urlFor("/echo?x=1"))
        request.send({ name: "Ann Lee", age: 42 })
        waitDone(request)
        compare(request.statusText, "200 OK")
        compare(request.attribute(NetworkRequest.HttpStatusCodeAttribute, true), 200)
        var sent = request.response
        compare(sent.body, "age=42&name=Ann%20Lee&x=1")
        compare(sent.headers["referer"], "http://from.example/")
        compare(sent.headers["x-custom"], "custom value")
        compare(request.responseHeaders["Content-Type"], "application/json")
    }

    function test_timeoutSignal() {
        var request = createTemporaryObject(requestComponent, testCase, { timeout: 150 })
        timeoutSpy.target = request
        request.open("GET", testHttpServer.urlFor("/hang"))
        request.send()
        waitDone(request)
        compare(timeoutSpy.count, 1)
        verify(request.errorText.length > 0)
    }

    function test_multipartFromScript() {
        var request = createTemporaryObject(requestComponent, testCase)
        request.open("POST", testHttpServer.urlFor("/echo"))
        request.send({ note: "hello", file: "@" + testDataFolder + "/network/sample.txt;type=text/x-sample" })
        waitDone(request)
        var sent = JSON.parse(request.responseText)
        verify(sent.multipartWellFormed)
        compare(sent.parts.map(function(part) { return part.name + " " + part.contentType }),
                ["note ", "file text/x-sample"])
        compare(sent.parts[1].filename, "sample.txt")
        compare(sent.parts[1].text, "Sample file for upload tests.\n")
    }
}
