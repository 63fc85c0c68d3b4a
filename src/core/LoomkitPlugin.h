#ifndef LOOMKITPLUGIN_H
#define LOOMKITPLUGIN_H

#include <QQmlExtensionPlugin>

class QJSEngine;
class QQmlEngine;

// The module's entry point: registers the types once per process and sets up
// each engine that imports Orvane.Loomkit.
class LoomkitPlugin : public QQmlExtensionPlugin
{
    Q_OBJECT
    Q_PLUGIN_METADATA(IID QQmlExtensionInterface_iid FILE "LoomkitPlugin.json")

public:
    explicit LoomkitPlugin(QObject *parent = nullptr);

    void registerTypes(const char *uri) override;
    void initializeEngine(QQmlEngine *engine, const char *uri) override;

    static QObject *loomkitProvider(QQmlEngine *engine, QJSEngine *scriptEngine);

private:
    static void initializeNetwork();
};

#endif // LOOMKITPLUGIN_H
