// Parses one file with the module's CSV parser or XML conversion and prints
// how long it took: "<seconds> <megabytes> <items> <user> <system>".
// Usage: bench_parsers csv|csv-text|csv-build|xml|xml-guard FILE
// csv-build parses the file untimed, then times building records of the
// same shape without reading anything: as many maps, the same keys, values
// and text lengths, made as the parser makes them. It is the part of a parse
// that no parser of this result type can avoid.
#include "CsvParser.h"
#include "XmlGuard.h"
#include "XmlUtility.h"

#include <QCoreApplication>
#include <QFile>
#include <QTextStream>

#include <cstdio>
#include <vector>

#include <malloc.h>
#include <sys/resource.h>

namespace {

// Processor time, not wall time: the machine is shared, and this is what
// the other side measures too. User and system time apart, as most of the
// system time goes to the kernel handing out fresh pages for the results,
// which costs more or less with the state of the machine.
struct CpuTime
{
    double user = 0;
    double system = 0;
};

CpuTime cpuTime()
{
    rusage usage;
    getrusage(RUSAGE_SELF, &usage);
    auto seconds = [](timeval t) { return double(t.tv_sec) + double(t.tv_usec) / 1e6; };
    return { seconds(usage.ru_utime), seconds(usage.ru_stime) };
}

class CpuTimer
{
public:
    void start() { m_start = cpuTime(); }
    CpuTime elapsed() const
    {
        const CpuTime now = cpuTime();
        return { now.user - m_start.user, now.system - m_start.system };
    }

private:
    CpuTime m_start;
};

void print(CpuTime time, double megabytes, qint64 items)
{
    std::printf("%.3f %.1f %lld %.3f %.3f\n", time.user + time.system, megabytes, static_cast<long long>(items),
                time.user, time.system);
    std::fflush(stdout);
}

// A value of a record, or the length of its text.
struct Cell
{
    QVariant value;
    int textLength = -1;
};

std::vector<std::vector<Cell>> shapesOf(const QVariantList &records)
{
    std::vector<std::vector<Cell>> shapes;
    shapes.reserve(size_t(records.size()));
    for (const QVariant &record : records) {
        const QVariantMap map = record.toMap();
        std::vector<Cell> cells;
        for (auto it = map.cbegin(); it != map.cend(); ++it) {
            Cell cell;
            if (it.value().userType() == QMetaType::QString)
                cell.textLength = it.value().toString().size();
            else
                cell.value = it.value();
            cells.push_back(cell);
        }
        shapes.push_back(std::move(cells));
    }
    return shapes;
}

QVariantList build(const std::vector<std::vector<Cell>> &shapes, const QStringList &headers)
{
    QString source(4096, QChar(0x142));
    QVariantMap prepared;
    for (const QString &header : headers)
        prepared.insert(header, QVariant());
    QVariantList result;
    for (const std::vector<Cell> &cells : shapes) {
        QVariantMap map = prepared;
        map.detach();
        auto cell = cells.cbegin();
        for (auto it = map.begin(); it != map.end(); ++it, ++cell) {
            if (cell->textLength >= 0)
                it.value() = QVariant(QString(source.constData(), cell->textLength));
            else
                it.value() = cell->value;
        }
        result.append(QVariant(map));
    }
    return result;
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const QStringList args = app.arguments();
    if (args.size() != 3) {
        std::fprintf(stderr, "usage: bench_parsers csv|csv-text|csv-build|xml|xml-guard FILE\n");
        return 2;
    }
    const QString mode = args.at(1);
    QFile file(args.at(2));
    const double megabytes = double(file.size()) / (1024.0 * 1024.0);
    CpuTimer timer;
    CpuTime seconds;
    qint64 items = 0;

    if (mode.startsWith(QLatin1String("csv"))) {
        if (mode == QLatin1String("csv-build")) {
            std::vector<std::vector<Cell>> shapes;
            QStringList headers;
            {
                CsvParser parser(&file);
                if (!parser.parse())
                    return 1;
                shapes = shapesOf(parser.records());
                headers = parser.headers();
            }
            // The parsed records are gone and their memory is given back to
            // the system, so that the records built get fresh pages, as a
            // parse's do.
            malloc_trim(0);
            timer.start();
            auto *built = new QVariantList(build(shapes, headers));
            print(timer.elapsed(), megabytes, built->size());
            std::_Exit(0);
        }
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
    print(seconds, megabytes, items);
    // The results are left to the operating system, as a script's would be.
    std::_Exit(0);
}
