import QtQuick 2.15
import QtTest 1.15
import Orvane.Loomkit 1.0

TestCase {
    name: "Values"
    when: windowShown

    CryptographicHash { id: hash; algorithm: CryptographicHash.Sha1 }
    MessageAuthenticationCode { id: mac; key: "Jefe"; algorithm: MessageAuthenticationCode.Sha256 }
    VersionNumber { id: version; versionString: "2.10.1-rc" }
    UrlInfo { id: urlInfo; url: "https://example.com/find?a=1&a=2&b=x%20y" }
    LocaleInfo { id: german; name: "de_DE" }

    TextInput {
        id: input
        validator: InputValidator {
            regularExpression: /[a-z]*/
            validate: function (text) { return text.length >= 3 ? InputValidator.Acceptable : InputValidator.Intermediate }
        }
    }

    function test_uuid() {
        var fresh = Loomkit.uuid()
        compare(fresh.string.length, 38)
        compare(fresh.version, 4)
        var parsed = Loomkit.uuid(fresh.withoutBraces)
        verify(parsed == fresh)
        verify(Loomkit.uuid() != fresh)
        compare(String(parsed), fresh.string)
        compare(Loomkit.uuid(fresh.rfc4122).string, fresh.string)
        verify(parsed.equals(fresh.id128))
    }

    function test_versions() {
        verify(Loomkit.compareVersionNumber([1, 2], "1.2.0") < 0)
        compare(Loomkit.compareVersionNumber(version, "2.10.1"), 0)
        var made = Loomkit.versionNumber(3, 0, 1)
        verify(made.compare(version) > 0)
        compare(Loomkit.versionNumber("4.5").segments, [4, 5])
    }

    function test_hashes() {
        hash.reset()
        verify(hash.addData("ab"))
        verify(hash.addData(new Uint8Array([99]).buffer))
        compare(hash.hex, "a9993e364706816aba3e25717850c26c9cd0d89d")
        compare(mac.hash(Loomkit.binaryData("what do ya want for nothing?")),
                "5bdcc146bf60754e6a042426089575c75a003f089d2739839dec58b964ec3843")
    }

    function test_url() {
        compare(urlInfo.queryParameters.a, ["1", "2"])
        compare(urlInfo.queryParameters.b, "x y")
        urlInfo.queryParameters = { q: "a&b", n: 3 }
        compare(urlInfo.query, "n=3&q=a%26b")
        var info = Loomkit.urlInfo("file:///tmp/a%20b.txt")
        verify(info.isLocalFile)
        compare(info.localFile, "/tmp/a b.txt")
    }

    function test_locale() {
        compare(german.formatDate(new Date(2024, 2, 5), "d. MMMM yyyy"), "5. M\u00e4rz 2024")
        compare(Loomkit.localeInfo(Qt.locale("fr_FR")).name, "fr_FR")
        compare(Loomkit.localeInfo(null).name, Qt.locale().name)
    }

    function test_validator() {
        input.text = "ab"
        verify(!input.acceptableInput)
        input.text = "abc"
        verify(input.acceptableInput)
        compare(input.validator.check("abc1"), InputValidator.Invalid)
    }
}
