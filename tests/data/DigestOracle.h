#ifndef DIGESTORACLE_H
#define DIGESTORACLE_H

#include "TestSupport.h"

#include <QRandomGenerator>
#include <QTemporaryDir>

// Python with the Debian crypto module is the oracle for hashes and MACs: it
// covers Keccak and MD4, which the openssl command line no longer offers.
namespace DigestOracle {

inline QByteArray randomBytes(quint32 seed, int size)
{
    QRandomGenerator generator(seed);
    QByteArray bytes(size, Qt::Uninitialized);
    for (char &c : bytes)
        c = char(generator.bounded(256));
    return bytes;
}

// Writes the inputs to the files "0", "1"... in dir and runs the script with
// their paths as sys.argv[1..]. Empty when python3 or its crypto module is
// missing, so the caller skips.
inline QByteArray hexDigest(const QTemporaryDir &dir, const QString &script, const QList<QByteArray> &inputs)
{
    QStringList paths;
    for (const QByteArray &input : inputs) {
        QFile file(dir.filePath(QString::number(paths.size())));
        if (!file.open(QIODevice::WriteOnly) || file.write(input) != input.size())
            return "cannot write " + file.fileName().toUtf8();
        paths << file.fileName();
    }
    int exitCode = 0;
    const QString prelude = QStringLiteral("import sys, hmac, hashlib\nfrom Cryptodome.Hash import keccak, MD4\n");
    const QByteArray out = TestSupport::run(QStringLiteral("/usr/bin/python3"),
                                            QStringList { QStringLiteral("-c"), prelude + script } + paths, &exitCode);
    return exitCode == 0 ? out.trimmed() : QByteArray();
}

} // namespace DigestOracle

#endif // DIGESTORACLE_H
