import QtQuick 2.15
import QtTest 1.15
import Orvane.Loomkit 1.0

TestCase {
    id: testCase
    name: "Exif"

    property url fileUrl

    Component { id: exifComponent; ExifInfo {} }
    Component { id: attributesComponent; ImageAttributes {} }

    function temporaryCopy(name) {
        // A separate target makes a full copy of the source.
        var copier = createTemporaryObject(attributesComponent, testCase)
        copier.filePath = testDataFolder + "/exif/camera/Kodak_CX7530.jpg"
        copier.destFilePath = Loomkit.resolvedPath("$TEMP/" + name)
        copier.remove("nothing")
        return copier.destFilePath
    }

    function test_cameraFile() {
        var info = createTemporaryObject(exifComponent, testCase)
        verify(info.load(testDataFolder + "/exif/camera/Kodak_CX7530.jpg"))
        verify(info.isExifValid)
        compare(info.fileName, "Kodak_CX7530.jpg")
        // The camera wrote no terminator, and the last byte of the count is dropped.
        compare(info.imageValue(ExifInfo.ImageMake), "EASTMAN KODAK COMPAN")
        fuzzyCompare(info.gpsLatitude, -(22 / 60 + 16.68 / 3600), 1e-6)
        verify(info.imageTags.indexOf(ExifInfo.ImageMake) >= 0)
        verify(info.gpsTags.length > 0)
        compare(typeof info.values.ImageModel, "string")
        compare(info.gpsTagName(ExifInfo.GpsLatitudeRef), "GPSLatitudeRef")
    }

    function test_scriptValues() {
        var info = createTemporaryObject(exifComponent, testCase)
        verify(isNaN(info.gpsLatitude))
        info.clear()
        info.setImageValue(ExifInfo.ImageBitsPerSample, [8, 8, 8])
        compare(info.imageValue(ExifInfo.ImageBitsPerSample), [8, 8, 8])
        info.setImageValue(ExifInfo.ImageDateTime, new Date(2021, 3, 4, 5, 6, 7))
        compare(info.values.ImageDateTime.getFullYear(), 2021)
        info.values = { "ImageMake": "Acme", "GpsLatitude": 10.5, "GpsLatitudeRef": "S" }
        compare(info.imageValue(ExifInfo.ImageMake), "Acme")
        compare(info.gpsLatitude, -10.5)
        compare(info.imageValue(ExifInfo.ImageBitsPerSample), undefined)
        info.gpsLongitude = -3.25
        compare(info.gpsValue(ExifInfo.GPSLongitudeRef), "W")
        compare(info.gpsLongitude, -3.25)
        verify(isNaN(info.gpsAltitude))
        info.gpsAltitude = 100
        compare(info.gpsAltitude, 100)
    }

    function test_saveAndReload() {
        var path = temporaryCopy("exif-save.jpg")
        var info = createTemporaryObject(exifComponent, testCase)
        verify(info.load(path))
        info.setImageValue(ExifInfo.ImageArtist, "QML")
        info.gpsLatitude = 51.5
        verify(info.save(path))
        var reread = createTemporaryObject(exifComponent, testCase)
        fileUrl = "file://" + path
        verify(reread.load(fileUrl))
        compare(reread.url, fileUrl)
        compare(reread.imageValue(ExifInfo.ImageArtist), "QML")
        compare(reread.gpsLatitude, 51.5)
        compare(reread.extendedValue(ExifInfo.ExtendedExifVersion).byteLength, 4)
    }

    function test_attributes() {
        var path = temporaryCopy("attributes.jpg")
        var attributes = createTemporaryObject(attributesComponent, testCase, { filePath: path })
        verify(attributes.setValue("note", "hello"))
        verify(attributes.setValue("map", { a: 1, b: [1, 2], c: { d: "e" } }))
        verify(attributes.setValue("number", 5))
        compare(attributes.value("note"), "hello")
        compare(attributes.value("map").b[1], 2)
        compare(attributes.value("map").c.d, "e")
        compare(Object.keys(attributes.values("n*")).sort(), ["note", "number"])
        // A number comes back as the bytes of its text.
        compare(new Uint8Array(attributes.value("number"))[0], 53)
        attributes.remove(["map", "number"])
        compare(attributes.keys(), ["note"])
        attributes.removeAll()
        compare(attributes.keys(), [])
        compare(attributes.value("note"), undefined)
    }
}
