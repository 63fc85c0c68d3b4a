#ifndef DIGESTORACLE_H
#define DIGESTORACLE_H

#include "TestSupport.h"

#include <QFile>
#include <QRandomGenerator>
#include <QStringList>

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

inline bool writeFile(const QString &path, const QByteArray &bytes)
{
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size();
}

// Runs the script with the files as sys.argv[1..]; empty when python3 or its
// crypto module is missing, so the caller skips.
inline QByteArray hexDigest(const QString &script, const QStringList &files)
{
    const QString python = QStringLiteral("/usr/bin/python3");
    if (!QFile::exists(python))
        return QByteArray();
    int exitCode = 0;
    const QString prelude = QStringLiteral("import sys, hmac, hashlib\nfrom Cryptodome.Hash import keccak, MD4\n");
    const QByteArray out = TestSupport::run(python, QStringList { QStringLiteral("-c"), prelude + script } + files,
                                            &exitCode).trimmed();
    return exitCode == 0 ? out : QByteArray();
}

} // namespace DigestOracle

#endif // DIGESTORACLE_H
