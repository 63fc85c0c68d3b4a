#include "ZipFileInfo.h"
#include "ZipEntryStream.h"

#include <cstring>

ZipFileInfo::ZipFileInfo(QObject *parent)
    : LoomkitObject(parent)
{
    std::memset(&m_info, 0, sizeof(m_info));
}

ZipFileInfo::ZipFileInfo(const QString &fileName, const unz_file_info64 &info, QObject *parent)
    : LoomkitObject(parent)
    , m_fileInfo(fileName)
    , m_info(info)
{
}

QDateTime ZipFileInfo::lastModified() const
{
    return ZipEntryStream::dateTime(m_info.tmu_date);
}
