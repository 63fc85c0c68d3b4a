#include "ZipExtractTarget.h"

#include <QFile>

#include <cerrno>
#include <climits>
#include <cstdlib>
#include <sys/stat.h>
#include <sys/types.h>

namespace {

bool lexists(const QString &path, struct stat *st)
{
    return ::lstat(QFile::encodeName(path).constData(), st) == 0;
}

QString realPath(const QString &path)
{
    char resolved[PATH_MAX];
    if (!::realpath(QFile::encodeName(path).constData(), resolved))
        return QString();
    return QFile::decodeName(resolved);
}

bool startsWithFolder(const QString &path, const QString &folder)
{
    // "/out" must not match "/outside": compare against the folder plus a separator.
    if (folder == QLatin1String("/"))
        return path.startsWith(folder);
    return path.size() > folder.size() && path.startsWith(folder) && path.at(folder.size()) == QLatin1Char('/');
}

} // namespace

ZipExtractTarget::ZipExtractTarget(const QDir &dir)
    : m_root(QDir::cleanPath(dir.absolutePath()))
{
}

QString ZipExtractTarget::target(const QString &name, bool allowRoot) const
{
    if (name.isEmpty() || QDir::isAbsolutePath(name))
        return QString();
    const QString path = QDir::cleanPath(m_root + QLatin1Char('/') + name);
    return isInside(path, allowRoot) ? path : QString();
}

bool ZipExtractTarget::isInside(const QString &path, bool allowRoot) const
{
    return (allowRoot && path == m_root) || startsWithFolder(path, m_root);
}

QString ZipExtractTarget::canonicalRoot()
{
    if (!m_canonicalRoot.isEmpty())
        return m_canonicalRoot;
    // The output folder may not exist yet: resolve its nearest existing
    // ancestor and add the rest, which will be made as plain folders.
    QString existing = m_root;
    QString rest;
    struct stat st;
    while (!lexists(existing, &st)) {
        const int slash = existing.lastIndexOf(QLatin1Char('/'));
        if (slash < 0)
            return QString();
        rest.prepend(existing.mid(slash));
        existing = slash == 0 ? QStringLiteral("/") : existing.left(slash);
    }
    const QString resolved = realPath(existing);
    if (resolved.isEmpty())
        return QString();
    m_canonicalRoot = QDir::cleanPath(resolved + rest);
    return m_canonicalRoot;
}

bool ZipExtractTarget::makeFolder(const QString &folder, bool *refused)
{
    if (refused)
        *refused = false;
    if (m_checked.contains(folder))
        return true;
    if (!isInside(folder, true)) {
        if (refused)
            *refused = true;
        return false;
    }
    const QString root = canonicalRoot();
    if (root.isEmpty())
        return false;

    // Find the deepest part of the path that exists (a dangling link counts
    // as existing), and check where it really leads.
    QString existing = folder;
    QStringList missing;
    struct stat st;
    while (!lexists(existing, &st)) {
        const int slash = existing.lastIndexOf(QLatin1Char('/'));
        if (slash <= 0)
            return false;
        missing.prepend(existing.mid(slash + 1));
        existing = existing.left(slash);
    }
    const QString resolved = realPath(existing);
    if (resolved.isEmpty()) {
        // A dangling link or an unreadable path: nothing safe to build on.
        if (refused)
            *refused = S_ISLNK(st.st_mode);
        return false;
    }
    const bool atOrBelowRoot = resolved == root || startsWithFolder(resolved, root);
    // Above the root is fine only while the root itself is still to be made.
    const bool aboveRoot = startsWithFolder(root, resolved) && startsWithFolder(m_root, existing);
    if (!atOrBelowRoot && !aboveRoot) {
        if (refused)
            *refused = true;
        return false;
    }

    // What exists must be a folder (through a link that stays inside).
    struct stat target;
    if (::stat(QFile::encodeName(resolved).constData(), &target) != 0 || !S_ISDIR(target.st_mode))
        return false;

    QString path = existing;
    for (const QString &part : qAsConst(missing)) {
        path += QLatin1Char('/') + part;
        const QByteArray native = QFile::encodeName(path);
        if (::mkdir(native.constData(), 0777) != 0) {
            // Lost a race or met something that is not a folder: look again.
            if (errno != EEXIST || ::lstat(native.constData(), &st) != 0 || !S_ISDIR(st.st_mode))
                return false;
        }
    }
    m_checked.insert(folder);
    return true;
}
