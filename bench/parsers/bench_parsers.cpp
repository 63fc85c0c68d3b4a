// Parses one file with the module's CSV parser or XML conversion and prints
// how long it took: "<seconds> <megabytes> <items>".
// Usage: bench_parsers csv|csv-text|xml FILE
#include "CsvParser.h"
#include "XmlGuard.h"
#include "XmlUtility.h"

#include <QCoreApplication>
#include <QFile>
#include <QTextStream>

#include <cstdio>
#include <ctime>

namespace {

// Processor time, not wall time: the machine is shared, and this is what
// the other side measures too.
double cpuSeconds()
{
    timespec now;
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
    return double(now.tv_sec) + double(now.tv_nsec) / 1e9;
}

class CpuTimer
{
public:
    void start() { m_start = cpuSeconds(); }
    double elapsed() const { return cpuSeconds() - m_start; }

private:
    double m_start = 0;
};

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const QStringList args = app.arguments();
    if (args.size() != 3) {
        std::fprintf(stderr, "usage: bench_parsers csv|csv-text|xml|xml-guard FILE\n");
        return 2;
    }
    const QString mode = args.at(1);
    QFile file(args.at(2));
    const double megabytes = double(file.size()) / (1024.0 * 1024.0);
    CpuTimer timer;
    double seconds = 0;
    qint64 items = 0;

    if (mode.startsWith(QLatin1String("csv"))) {
        QVariantMap options;
        if (mode == QLatin1String("csv-text"))
            options.insert(QStringLiteral("valueType"), QStringLiteral("text"));
        // Created before the clock starts and destroyed after it stops, like
        // the rows on the other side.
        auto *parser = new CsvParser(&file);
        timer.start();
        if (!parser->parse(options)) {
            std::fprintf(stderr, "parse failed: %s\n", qPrintable(parser->errorString()));
            return 1;
        }
        items = parser->records().size();
        seconds = timer.elapsed();
        if (parser->errors().size() > 1)
            std::fprintf(stderr, "%d errors, first: %s\n", parser->errors().size(),
                         qPrintable(parser->errors().first().message));
    } else {
        // The file's text is read before the clock starts: the conversion
        // takes text, as script hands it over.
        if (!file.open(QIODevice::ReadOnly))
            return 1;
        const QString text = QString::fromUtf8(file.readAll());
        timer.start();
        if (mode == QLatin1String("xml-guard")) {
            items = XmlGuard::check(text) ? 1 : 0;
            seconds = timer.elapsed();
        } else {
            auto *result = new QVariantMap(XmlUtility::toVariantMap(text));
            seconds = timer.elapsed();
            items = result->size();
            if (result->isEmpty()) {
                std::fprintf(stderr, "conversion gave an empty map\n");
                return 1;
            }
        }
    }
    std::printf("%.3f %.1f %lld\n", seconds, megabytes, static_cast<long long>(items));
    std::fflush(stdout);
    // The results are left to the operating system, as a script's would be.
    std::_Exit(0);
}
