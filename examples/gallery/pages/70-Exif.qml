import QtQuick 2.15
import Orvane.Loomkit 1.0
import "../components"

Panel {
    id: panel
    title: "Exif"

    readonly property url sample: Qt.resolvedUrl("../images/exif-sample.jpg")

    ExifInfo { id: exif; url: panel.sample }
    ImageAttributes { id: attributes; fileUrl: panel.sample }

    function fraction(seconds) {
        return seconds > 0 && seconds < 1 ? "1/" + Math.round(1 / seconds) + " s" : seconds + " s"
    }

    Column {
        width: parent.width
        spacing: 4

        Row {
            spacing: 10
            Image {
                width: 170; height: 113
                source: panel.sample
                fillMode: Image.PreserveAspectFit
            }
            // The position on a plain longitude/latitude grid.
            Rectangle {
                id: map
                width: 200; height: 100
                anchors.verticalCenter: parent.verticalCenter
                color: "#dfe9f3"
                border.color: "#b8c4d3"
                Repeater {
                    model: 11
                    Rectangle { x: (index + 1) * map.width / 12; width: 1; height: map.height; color: "#c5d2e1" }
                }
                Repeater {
                    model: 5
                    Rectangle { y: (index + 1) * map.height / 6; height: 1; width: map.width; color: "#c5d2e1" }
                }
                Rectangle {
                    visible: !isNaN(exif.gpsLatitude) && !isNaN(exif.gpsLongitude)
                    width: 9; height: 9; radius: 4.5
                    color: "#d9412b"; border.color: "white"
                    x: (exif.gpsLongitude + 180) / 360 * map.width - width / 2
                    y: (90 - exif.gpsLatitude) / 180 * map.height - height / 2
                }
                Text {
                    anchors { left: parent.left; bottom: parent.bottom; margins: 3 }
                    text: "lon/lat grid, 30°"
                    font.pixelSize: 9
                    color: "#5a6475"
                }
            }
        }
        Fact { name: "Exif data"; value: exif.isExifValid ? exif.imageTags.length + " image, " + exif.extendedTags.length
                                                             + " Exif, " + exif.gpsTags.length + " GPS tags" : "none" }
        Fact { name: "Camera"; value: (exif.values.ImageMake || "") + " " + (exif.values.ImageModel || "") }
        Fact {
            name: "Taken"
            value: exif.values.ExtendedDateTimeOriginal
                   ? Qt.formatDateTime(exif.values.ExtendedDateTimeOriginal, "yyyy-MM-dd hh:mm:ss") : ""
        }
        Fact {
            name: "Exposure"
            value: exif.isExifValid ? panel.fraction(exif.values.ExtendedExposureTime) + ", f/"
                                      + exif.values.ExtendedFNumber + ", ISO " + exif.values.ExtendedISOSpeedRatings : ""
        }
        Fact { name: "Focal length"; value: exif.values.ExtendedFocalLength + " mm" }
        Fact {
            name: "Position"
            value: exif.gpsLatitude.toFixed(4) + "°, " + exif.gpsLongitude.toFixed(4) + "°"
        }
        Fact { name: "Altitude"; value: exif.gpsAltitude + " m" }
        Fact { name: "Description"; value: exif.values.ImageDescription }
        // Function results don't notify; the file path makes them read again.
        Fact { name: "Attributes"; value: attributes.filePath ? attributes.keys().join(", ") : "" }
        Fact { name: "Caption"; value: attributes.filePath ? attributes.value("caption") : "" }
    }
}
