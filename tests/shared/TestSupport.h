#ifndef TESTSUPPORT_H
#define TESTSUPPORT_H

#include <QString>

namespace TestSupport {

// Folder of the committed test data (tests/fixtures).
QString dataPath(const QString &relativePath = QString());

// True if an external program is on PATH; oracle tests skip without it.
bool hasProgram(const QString &program);

// Runs a program and returns its standard output; exitCode receives its status.
QByteArray run(const QString &program, const QStringList &arguments, int *exitCode = nullptr,
               const QString &workingDirectory = QString(), int timeoutMs = 60000);

} // namespace TestSupport

#endif // TESTSUPPORT_H
