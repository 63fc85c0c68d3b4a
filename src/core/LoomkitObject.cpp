#include "LoomkitObject.h"

LoomkitObject::LoomkitObject(QObject *parent)
    : QObject(parent)
{
}
