#include "AppUtilsLinux.h"

#include <QtTest>

class tst_AppUtilsLinux : public QObject
{
    Q_OBJECT

private slots:
    void cpuInfo_data();
    void cpuInfo();
    void machineFiles();
};

static void writeFile(const QString &path, const QByteArray &content)
{
    QFile file(path);
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.write(content);
}

void tst_AppUtilsLinux::cpuInfo_data()
{
    QTest::addColumn<QByteArray>("cpuInfo");
    QTest::addColumn<int>("processors");
    QTest::addColumn<QString>("vendor");
    QTest::addColumn<QString>("modelName");
    QTest::addColumn<int>("family");

    QTest::newRow("x86, two processors, first one counts")
        << QByteArray("processor\t: 0\nvendor_id\t: GenuineIntel\ncpu family\t: 6\nmodel\t\t: 158\n"
                      "model name\t: Intel(R) Core(TM) i7-8700 CPU @ 3.20GHz\nstepping\t: 10\n\n"
                      "processor\t: 1\nvendor_id\t: Other\nmodel name\t: Other\n")
        << 2 << "GenuineIntel" << "Intel(R) Core(TM) i7-8700 CPU @ 3.20GHz" << 6;
    QTest::newRow("arm")
        << QByteArray("processor\t: 0\nBogoMIPS\t: 48.00\nCPU implementer\t: 0x41\nCPU architecture: 8\n"
                      "CPU part\t: 0xd08\nCPU revision\t: 3\n\nModel\t\t: Raspberry Pi 4 Model B Rev 1.4\n")
        << 1 << "0x41" << "Raspberry Pi 4 Model B Rev 1.4" << 8;
    QTest::newRow("garbage") << QByteArray("\x00\xff no colon here\n:\n") << 0 << "" << "" << 0;
}

void tst_AppUtilsLinux::cpuInfo()
{
    QFETCH(QByteArray, cpuInfo);
    const QVariantMap info = AppUtilsLinux::parseCpuInfo(cpuInfo);
    QTEST(info.value("linuxNumberOfProcessors").toInt(), "processors");
    QTEST(info.value("linuxProcessorVendor").toString(), "vendor");
    QTEST(info.value("linuxProcessorModelName").toString(), "modelName");
    QTEST(info.value("linuxProcessorFamily").toInt(), "family");
}

void tst_AppUtilsLinux::machineFiles()
{
    QTemporaryDir dir;
    writeFile(dir.filePath("product_name"), QByteArray("ThinkPad X1 Carbon Gen 9  \n"));
    writeFile(dir.filePath("sys_vendor"), QByteArray("LENOVO\0\0\n", 9));
    QCOMPARE(AppUtilsLinux::readDmiValue(dir.path(), "product_name"), QStringLiteral("ThinkPad X1 Carbon Gen 9"));
    QCOMPARE(AppUtilsLinux::readDmiValue(dir.path(), "sys_vendor"), QStringLiteral("LENOVO"));
    QCOMPARE(AppUtilsLinux::readDmiValue(dir.path(), "product_family"), QString());

    writeFile(dir.filePath("org.example.Viewer.desktop"), "[Desktop Entry]\nName=Viewer\n");
    QVERIFY(AppUtilsLinux::isDesktopEntryInstalled("org.example.Viewer", { dir.path() }));
    QVERIFY(AppUtilsLinux::isDesktopEntryInstalled("org.example.Viewer.desktop", { dir.path() }));
    QVERIFY(!AppUtilsLinux::isDesktopEntryInstalled("org.example.Missing", { dir.path() }));

    AppUtilsLinux utils;
    QVERIFY(utils.processorInformation().value("linuxPageSize").toLongLong() >= 4096);
    QVERIFY(utils.isAppInstalled(QStringLiteral("sh")));       // on PATH
    QVERIFY(utils.isAppInstalled(QStringLiteral("/bin/sh")));  // absolute
    QVERIFY(!utils.isAppInstalled(QStringLiteral("no-such-program-xyz")));
    QVERIFY(!utils.isAppInstalled(QString()));
    QVERIFY(!utils.isAppInstalled(QStringLiteral("no-such-scheme-xyz:")));
}

QTEST_GUILESS_MAIN(tst_AppUtilsLinux)
#include "tst_AppUtilsLinux.moc"
