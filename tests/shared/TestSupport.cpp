#include "TestSupport.h"

#include <QDir>
#include <QProcess>
#include <QStandardPaths>

namespace TestSupport {

QString dataPath(const QString &relativePath)
{
    QString base = qEnvironmentVariable("LOOMKIT_TEST_DATA");
    if (base.isEmpty())
        base = QStringLiteral(LOOMKIT_TEST_DATA_DIR);
    return relativePath.isEmpty() ? base : QDir(base).filePath(relativePath);
}

bool hasProgram(const QString &program)
{
    return !QStandardPaths::findExecutable(program).isEmpty();
}

QByteArray run(const QString &program, const QStringList &arguments, int *exitCode,
               const QString &workingDirectory, int timeoutMs)
{
    QProcess process;
    if (!workingDirectory.isEmpty())
        process.setWorkingDirectory(workingDirectory);
    process.start(program, arguments);
    if (!process.waitForFinished(timeoutMs)) {
        process.kill();
        process.waitForFinished();
        if (exitCode)
            *exitCode = -1;
        return QByteArray();
    }
    if (exitCode)
        *exitCode = process.exitStatus() == QProcess::NormalExit ? process.exitCode() : -1;
    return process.readAllStandardOutput();
}

} // namespace TestSupport
