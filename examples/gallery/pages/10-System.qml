import QtQuick 2.15
import Orvane.Loomkit 1.0
import "../components"

Panel {
    title: "System"
    Column {
        width: parent.width
        spacing: 4
        Fact { name: "Loomkit version"; value: Loomkit.version }
        Fact { name: "Qt version"; value: Loomkit.qtVersion }
        Fact { name: "OS"; value: Loomkit.osName + " – " + Loomkit.osDisplayName }
        Fact { name: "Kernel"; value: Loomkit.kernelType + " " + Loomkit.kernelVersion }
        Fact { name: "CPU"; value: Loomkit.currentCpuArchitecture }
        Fact { name: "Processor"; value: Loomkit.systemInformation.linuxProcessorModelName }
        Fact { name: "Processors"; value: Loomkit.systemInformation.linuxNumberOfProcessors }
        Fact { name: "Model"; value: Loomkit.systemInformation.model || "(not readable)" }
        Fact { name: "Scale factor"; value: Loomkit.displayScaleFactor.toFixed(2) }
        Fact { name: "System locale"; value: Loomkit.systemLocale }
        Fact { name: "Home"; value: Loomkit.userHomePath }
        Fact { name: "~/data resolves to"; value: Loomkit.resolvedPath("~/data") }
        Fact { name: "typeOf(1.5)"; value: Loomkit.typeOf(1.5) }
        Fact { name: "typeOf(this, true)"; value: Loomkit.typeOf(parent, true) }
        Row {
            spacing: 6
            Repeater {
                model: ["#202830", "#808080", "#f2b134", "#5fd0c4"]
                Rectangle {
                    width: 56; height: 28; radius: 4; color: modelData
                    Text { anchors.centerIn: parent; text: "Aa"; color: Loomkit.contrastColor(parent.color) }
                }
            }
        }
    }
}
