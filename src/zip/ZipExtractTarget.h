#ifndef ZIPEXTRACTTARGET_H
#define ZIPEXTRACTTARGET_H

#include <QDir>
#include <QSet>
#include <QString>

// Keeps an extraction inside its output folder. Every archive is treated as
// hostile: a name that is absolute, climbs out with "..", or reaches outside
// through a symbolic link that already exists on disk is refused. Folders
// are made here, one level at a time, never through a link that leads out.
class ZipExtractTarget
{
public:
    explicit ZipExtractTarget(const QDir &dir);

    // The absolute, clean path of name under the output folder, or a null
    // string if it would lie outside. The folder itself counts as inside
    // only when allowRoot is set.
    QString target(const QString &name, bool allowRoot = false) const;

    // Makes folder (an absolute path that target() gave, or a parent of one)
    // with its parents, after checking that none of the existing ones leads
    // out of the output folder. Gives false on a refusal or a failure;
    // *refused tells which.
    bool makeFolder(const QString &folder, bool *refused = nullptr);

    QString root() const { return m_root; }

private:
    bool isInside(const QString &path, bool allowRoot) const;
    QString canonicalRoot();

    QString m_root;
    QString m_canonicalRoot;
    // Folders already checked and present. Nothing in an extraction makes a
    // link, so a folder once checked stays safe for the rest of the walk.
    QSet<QString> m_checked;
};

#endif // ZIPEXTRACTTARGET_H
