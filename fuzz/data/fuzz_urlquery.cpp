// Builds a map of names and values from the input, turns it into query text
// and back: the map must come back exactly. Then parses the input itself as
// a URL and reads every part.
#include "UrlInfo.h"

#include <QUrl>

#include <cstdlib>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const QString text = QString::fromUtf8(reinterpret_cast<const char *>(data), int(size));
    const QStringList parts = text.split(QChar(0));

    QVariantMap map;
    for (int i = 0; i + 1 < parts.size(); i += 2)
        map.insert(parts.at(i), parts.at(i + 1));

    const QString query = UrlInfo::toQuery(map);
    QUrl url(QStringLiteral("http://example.com/p"));
    url.setQuery(query.isEmpty() ? QString() : query, QUrl::TolerantMode);
    if (!map.isEmpty() && UrlInfo::queryMap(url) != map)
        abort();

    UrlInfo info { QUrl(text) };
    info.queryParameters();
    info.fileName();
    info.suffix();
    info.localFile();
    info.setQueryParameters(info.queryParameters());
    return 0;
}
