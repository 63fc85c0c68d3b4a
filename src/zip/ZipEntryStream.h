#ifndef ZIPENTRYSTREAM_H
#define ZIPENTRYSTREAM_H

#include <QByteArray>
#include <QDateTime>
#include <QFile>

#include <unzip.h>

// The pieces of an archive walk that ZipReader and UnZipFile share: the
// entry's name and record in one library call, the date rule, and the
// chunked copy of the current entry into an open file.
class ZipEntryStream
{
public:
    // Size of the buffer that receives an entry's name; longer names are cut.
    static constexpr int NameBufferSize = 1024;
    // Chunk size of extraction and of writing: large enough that the
    // library's own buffers, not our calls, set the pace.
    static constexpr int ChunkSize = 256 * 1024;

    // Fills name (cut to NameBufferSize bytes, never read past the end) and
    // info for the current entry. Gives the library's result; on failure the
    // outputs hold what the call left.
    static int currentEntry(unzFile zip, QByteArray *name, unz_file_info64 *info);

    // Local date-time of an entry's date parts. The day is taken one later
    // than stored, matching the one-earlier day that ZipWriter stores.
    static QDateTime dateTime(const tm_unz &date);

    // Copies the opened current entry into file in ChunkSize pieces. Before
    // each chunk is written, progress(countBeforeChunk) is called. Gives 0 at
    // the end of the entry's data, or the negative read result.
    template <typename Progress>
    static int copyCurrent(unzFile zip, QFile &file, QByteArray &buffer, Progress &&progress)
    {
        if (buffer.size() != ChunkSize)
            buffer.resize(ChunkSize);
        char *data = buffer.data();
        qint64 count = 0;
        for (;;) {
            const int read = unzReadCurrentFile(zip, data, unsigned(ChunkSize));
            if (read <= 0)
                return read;
            progress(count);
            if (file.write(data, read) != read)
                reportShortWrite(file);
            count += read;
        }
    }

    // Opens path for writing, truncating it, without following a symbolic
    // link in its last component when noFollow is set.
    static bool openOutput(QFile &file, const QString &path, bool noFollow);

private:
    static void reportShortWrite(const QFile &file);
};

#endif // ZIPENTRYSTREAM_H
