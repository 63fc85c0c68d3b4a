#ifndef LOOMKITOBJECT_H
#define LOOMKITOBJECT_H

#include <QObject>

// Common base of the module's QML object types. Deliberately empty.
class LoomkitObject : public QObject
{
    Q_OBJECT

public:
    explicit LoomkitObject(QObject *parent = nullptr);
};

#endif // LOOMKITOBJECT_H
