#include "Loomkit.h"
#include "Environment.h"
#include "File.h"
#include "FileFolder.h"
#include "FileInfo.h"
#include "FileUtility.h"
#include "LoomkitLogging.h"
#include "StandardPaths.h"
#include "platform/AppUtilsPrivate.h"

#include <QClipboard>
#include <QCoreApplication>
#include <QGeoCoordinate>
#include <QGuiApplication>
#include <QImage>
#include <QKeyEvent>
#include <QKeySequence>
#include <QLocale>
#include <QMetaMethod>
#include <QMetaProperty>
#include <QQmlEngine>
#include <QQmlListReference>
#include <QQuickItem>
#include <QQuickWindow>
#include <QRegularExpression>
#include <QScreen>
#include <QSslSocket>
#include <QSysInfo>
#include <QUuid>

namespace {

Loomkit *s_instance = nullptr;

constexpr double kReferenceDotsPerInch = 96.0;
constexpr int kKeyMask = 0x01FFFFFF;
constexpr int kModifierMask = int(0xFE000000);

QGuiApplication *guiApplication()
{
    auto *app = qobject_cast<QGuiApplication *>(QCoreApplication::instance());
    if (!app)
        qFatal("This is not a GUI application");
    return app;
}

QScreen *primaryScreen()
{
    return guiApplication()->primaryScreen();
}

} // namespace

Loomkit::Loomkit(QObject *parent)
    : QObject(parent)
{
    {
        // A marker that tools can find in the binary; nothing reads it.
        const QString versionRecord = QStringLiteral(
            "\n<QuorloVersionInfo><Loomkit>5.4.142</Loomkit><QtVersion>5.15.6</QtVersion>"
            "<BuildDate>Aug 14 2022 05:37:23</BuildDate></QuorloVersionInfo>\n");
        Q_UNUSED(versionRecord)
    }

    QScreen *screen = primaryScreen();
    if (screen) {
        qCDebug(lcCore) << Q_FUNC_INFO << "devicePixelRatio" << screen->devicePixelRatio()
                        << "primaryScreen.physicalDotsPerInch" << screen->physicalDotsPerInch()
                        << "primaryScreen.logicalDotsPerInch" << screen->logicalDotsPerInch()
                        << "referenceDotsPerInch" << kReferenceDotsPerInch;
        connect(screen, &QScreen::logicalDotsPerInchChanged, this, &Loomkit::onLogicalDotsPerInchChanged);
    }

    m_appUtils = AppUtilsPrivate::create(this);
}

Loomkit::~Loomkit()
{
    qCDebug(lcCore) << "Destructor: " << this;
    if (s_instance == this)
        s_instance = nullptr;
}

Loomkit *Loomkit::instance(QQmlEngine *engine)
{
    if (!s_instance)
        s_instance = new Loomkit(engine);
    qCDebug(lcPlugin) << Q_FUNC_INFO << s_instance;
    return s_instance;
}

QQmlEngine *Loomkit::engine() const
{
    QQmlEngine *result = qmlEngine(this);
    if (!result)
        result = qobject_cast<QQmlEngine *>(parent());
    if (!result)
        qCCritical(lcCore) << Q_FUNC_INFO << "Null engine";
    return result;
}

QQuickWindow *Loomkit::window() const
{
    const QWindowList windows = QGuiApplication::topLevelWindows();
    for (QWindow *candidate : windows) {
        if (auto *quickWindow = qobject_cast<QQuickWindow *>(candidate))
            return quickWindow;
    }
    qCCritical(lcCore) << Q_FUNC_INFO << "No QuickWindow found";
    return nullptr;
}

// Properties

QString Loomkit::userHomePath()
{
    const QString current = m_userHome.path();
    if (!current.isEmpty() && current != QLatin1String("."))
        return current;

    QString path;
    if (QCoreApplication *app = QCoreApplication::instance()) {
        path = app->property("userHomePath").toString();
        if (!path.isEmpty()) {
            qCDebug(lcCore) << Q_FUNC_INFO << "App property:" << path;
            FileUtility::setPathVariable(QStringLiteral("HOME"), path);
        }
    }
    if (path.isEmpty()) {
        path = FileUtility::homePath();
        qCDebug(lcCore) << Q_FUNC_INFO << "Default:" << path;
    }
    m_userHome.setPath(path);
    return m_userHome.path();
}

void Loomkit::setUserHomePath(const QString &path)
{
    if (path == m_userHome.path())
        return;
    m_userHome.setPath(path);
    FileUtility::setPathVariable(QStringLiteral("HOME"), path);
    qCDebug(lcCore) << Q_FUNC_INFO << path;
    emit userHomePathChanged();
}

QString Loomkit::offlineStoragePath() const
{
    QQmlEngine *qmlEngine = engine();
    return qmlEngine ? qmlEngine->offlineStoragePath() : QString();
}

void Loomkit::setOfflineStoragePath(const QString &path)
{
    QQmlEngine *qmlEngine = engine();
    if (!qmlEngine || path == qmlEngine->offlineStoragePath())
        return;
    qmlEngine->setOfflineStoragePath(path);
    emit offlineStoragePathChanged();
}

QString Loomkit::version() const
{
    return QStringLiteral("5.4.142").trimmed();
}

QString Loomkit::sslLibraryVersion() const
{
    return QSslSocket::sslLibraryVersionString();
}

QString Loomkit::sslLibraryBuildVersion() const
{
    return QSslSocket::sslLibraryBuildVersionString();
}

QString Loomkit::osName() const
{
    return m_appUtils->osName();
}

QString Loomkit::osDisplayName() const
{
    return QSysInfo::prettyProductName();
}

QString Loomkit::osVersion() const
{
    return QSysInfo::productVersion();
}

QString Loomkit::kernelType() const
{
    return QSysInfo::kernelType();
}

QString Loomkit::kernelVersion() const
{
    return QSysInfo::kernelVersion();
}

QString Loomkit::qtVersion() const
{
    return QString::fromLatin1(qVersion());
}

QString Loomkit::buildAbi() const
{
    return QSysInfo::buildAbi();
}

QString Loomkit::buildCpuArchitecture() const
{
    return QSysInfo::buildCpuArchitecture();
}

QString Loomkit::currentCpuArchitecture() const
{
    return QSysInfo::currentCpuArchitecture();
}

QVariantMap Loomkit::systemInformation() const
{
    QVariantMap information = m_appUtils->processorInformation();
    information.insert(QStringLiteral("model"), m_appUtils->model());
    information.insert(QStringLiteral("manufacturer"), m_appUtils->manufacturer());
    information.insert(QStringLiteral("family"), m_appUtils->family());
    return information;
}

double Loomkit::displayScaleFactor() const
{
    if (m_displayScaleFactor > 0)
        return m_displayScaleFactor;
    QScreen *screen = primaryScreen();
    return screen ? screen->logicalDotsPerInch() / kReferenceDotsPerInch : 1.0;
}

void Loomkit::setDisplayScaleFactor(double factor)
{
    // Always notifies: a reset must reach bindings even if the value is equal.
    m_displayScaleFactor = factor;
    if (factor <= 0) {
        qCDebug(lcCore) << Q_FUNC_INFO << "Reset to default scale factor";
        m_displayScaleFactor = 0;
    }
    emit displayScaleFactorChanged();
}

void Loomkit::onLogicalDotsPerInchChanged(double dpi)
{
    QScreen *screen = primaryScreen();
    qCDebug(lcCore) << Q_FUNC_INFO << dpi << "devicePixelRatio" << (screen ? screen->devicePixelRatio() : 0)
                    << "physicalDotsPerInch" << (screen ? screen->physicalDotsPerInch() : 0)
                    << "logicalDotsPerInch" << (screen ? screen->logicalDotsPerInch() : 0);
    if (!(m_displayScaleFactor > 0))
        emit displayScaleFactorChanged();
}

QStringList Loomkit::importPathList() const
{
    QQmlEngine *qmlEngine = engine();
    return qmlEngine ? qmlEngine->importPathList() : QStringList();
}

void Loomkit::setImportPathList(const QStringList &list)
{
    QQmlEngine *qmlEngine = engine();
    if (!qmlEngine)
        return;
    qmlEngine->setImportPathList(list);
    emit importPathListChanged();
}

QString Loomkit::defaultLocale() const
{
    return QLocale().name();
}

void Loomkit::setDefaultLocale(const QString &name)
{
    const QLocale locale(name);
    if (locale.name() == QLocale().name())
        return;
    QLocale::setDefault(locale);
    emit defaultLocaleChanged();
}

QStringList Loomkit::availableLocaleNames()
{
    if (m_availableLocaleNames.isEmpty()) {
        const QList<QLocale> locales = QLocale::matchingLocales(QLocale::AnyLanguage, QLocale::AnyScript, QLocale::AnyCountry);
        for (const QLocale &locale : locales)
            m_availableLocaleNames.append(locale.name());
    }
    return m_availableLocaleNames;
}

QString Loomkit::systemLocale() const
{
    return QLocale::system().name();
}

// Paths

QString Loomkit::resolvedPath(const QString &path)
{
    return FileUtility::resolvedPath(path, true);
}

QString Loomkit::resolvedPath(const QUrl &pathUrl)
{
    return FileUtility::resolvedPath(pathUrl, true);
}

QUrl Loomkit::resolvedPathUrl(const QString &pathUrl)
{
    return FileUtility::resolvedPathUrl(pathUrl, true);
}

QString Loomkit::pathVariable(const QString &name)
{
    return FileUtility::pathVariable(name, QString(), true);
}

void Loomkit::setPathVariable(const QString &name, const QString &value)
{
    FileUtility::setPathVariable(name, value);
}

QUrl Loomkit::resolvedUrl(const QUrl &url)
{
    return url;
}

bool Loomkit::openUrlExternally(const QUrl &url)
{
    return m_appUtils->openUrlExternally(url);
}

// Colours

QColor Loomkit::contrastColor(const QColor &color, const QColor &tintColor)
{
    const QRgb rgb = color.rgb();
    const int gray = (qRed(rgb) * 11 + qGreen(rgb) * 16 + qBlue(rgb) * 5) / 32;
    const QColor base = gray <= 128 ? QColor(Qt::white) : QColor(Qt::black);

    if (!tintColor.isValid())
        return base;
    if (tintColor.alpha() == 255)
        return tintColor;
    if (tintColor.alpha() == 0)
        return base;

    const qreal a = tintColor.alphaF();
    return QColor::fromRgbF(base.redF() * (1 - a) + tintColor.redF() * a,
                            base.greenF() * (1 - a) + tintColor.greenF() * a,
                            base.blueF() * (1 - a) + tintColor.blueF() * a,
                            base.alphaF() * (1 - a) + a);
}

QColor Loomkit::contrastColor(const QColor &color)
{
    return contrastColor(color, QColor());
}

QColor Loomkit::alphaColor(const QColor &color, double alpha)
{
    QColor result(color);
    result.setAlphaF(alpha);
    return result;
}

// Identifiers

QString Loomkit::createId()
{
    qCWarning(lcCore) << "Loomkit.createId() will be deprecated. Use Loomkit.uuid() instead.";
    QString id = QUuid::createUuid().toString();
    id.remove(QLatin1Char('-'));
    id.remove(QLatin1Char('{'));
    id.remove(QLatin1Char('}'));
    return id;
}

QString Loomkit::createUuidString(int format)
{
    qCWarning(lcCore) << "Loomkit.createUuidString() will be deprecated. Use Loomkit.uuid() instead.";
    QString id = QUuid::createUuid().toString();
    if (format > 0) {
        id.remove(QLatin1Char('{'));
        id.remove(QLatin1Char('}'));
    }
    if (format >= 2)
        id.remove(QLatin1Char('-'));
    return id;
}

QString Loomkit::createUuidString()
{
    return createUuidString(0);
}

// Engine

void Loomkit::clearComponentCache()
{
    QQmlEngine *qmlEngine = engine();
    if (!qmlEngine) {
        qCCritical(lcCore) << Q_FUNC_INFO << "Null engine";
        return;
    }
    qmlEngine->clearComponentCache();
}

void Loomkit::trimComponentCache()
{
    if (QQmlEngine *qmlEngine = engine())
        qmlEngine->trimComponentCache();
}

void Loomkit::addImportPath(const QString &path)
{
    QQmlEngine *qmlEngine = engine();
    if (!qmlEngine)
        return;
    qmlEngine->addImportPath(path);
    emit importPathListChanged();
}

void Loomkit::removeImportPath(const QString &path)
{
    QQmlEngine *qmlEngine = engine();
    if (!qmlEngine)
        return;
    QStringList list = qmlEngine->importPathList();
    if (list.removeAll(path) == 0)
        return;
    qmlEngine->setImportPathList(list);
    emit importPathListChanged();
}

void Loomkit::collectGarbage()
{
    qCDebug(lcCore) << Q_FUNC_INFO;
    if (QQmlEngine *qmlEngine = engine())
        qmlEngine->collectGarbage();
}

// Type inspection

QString Loomkit::typeOf(const QJSValue &value, bool displayName)
{
    if (value.isUndefined())
        return QStringLiteral("undefined");
    if (value.isNull())
        return QStringLiteral("null");
    if (value.isString())
        return QStringLiteral("string");

    if (value.isQObject()) {
        QObject *object = value.toQObject();
        QString name = object ? QString::fromLatin1(object->metaObject()->className()) : QStringLiteral("null");
        if (displayName) {
            static const QRegularExpression typeTail(QStringLiteral("_QMLTYPE_\\d+"));
            static const QRegularExpression qmlTail(QStringLiteral("_QML_\\d+"));
            name.remove(typeTail);
            name.remove(qmlTail);
            if (name.startsWith(QLatin1String("QQuick")))
                name = name.mid(6);
            else if (name.startsWith(QLatin1String("QQml")))
                name = name.mid(4);
        }
        return name;
    }

    if (value.isCallable())
        return QStringLiteral("function");

    const QVariant variant = value.toVariant();
    switch (variant.userType()) {
    case QMetaType::Bool: return QStringLiteral("bool");
    case QMetaType::Int: return QStringLiteral("int");
    case QMetaType::Double: return QStringLiteral("double");
    case QMetaType::QVariantMap: return QStringLiteral("object");
    case QMetaType::QStringList: return QStringLiteral("array");
    case QMetaType::QDateTime: return QStringLiteral("date");
    case QMetaType::QUrl: return QStringLiteral("url");
    case QMetaType::QRectF: return QStringLiteral("rect");
    case QMetaType::QSizeF: return QStringLiteral("size");
    case QMetaType::QPointF: return QStringLiteral("point");
    case QMetaType::QRegExp: return QStringLiteral("regexp");
    case QMetaType::QFont: return QStringLiteral("font");
    case QMetaType::QColor: return QStringLiteral("color");
    case QMetaType::QMatrix4x4: return QStringLiteral("matrix4x4");
    case QMetaType::QVector2D: return QStringLiteral("vector2d");
    case QMetaType::QVector3D: return QStringLiteral("vector3d");
    case QMetaType::QVector4D: return QStringLiteral("vector4d");
    case QMetaType::QQuaternion: return QStringLiteral("quaternion");
    default:
        break;
    }

    if (variant.userType() != QMetaType::QVariantList) {
        static const int listType = qRegisterMetaType<QQmlListReference>("QQmlListReference");
        static const int coordinateType = qRegisterMetaType<QGeoCoordinate>("QGeoCoordinate");
        if (variant.userType() == listType || variant.canConvert(listType))
            return QStringLiteral("list");
        if (variant.userType() == coordinateType || variant.canConvert(coordinateType))
            return QStringLiteral("coordinate");
    }

    if (value.isNumber())
        return QStringLiteral("number");
    if (value.isArray())
        return QStringLiteral("array");

    qCDebug(lcCore) << Q_FUNC_INFO << variant << variant.typeName();
    return QString::fromLatin1(variant.typeName());
}

QString Loomkit::typeOf(const QJSValue &value)
{
    return typeOf(value, false);
}

bool Loomkit::instanceOf(const QJSValue &value, const QJSValue &type)
{
    const QString name = type.isString() ? type.toString() : typeOf(type, false);
    if (name.isEmpty())
        return false;
    if (typeOf(value, false) == name)
        return true;

    QObject *object = value.isQObject() ? value.toQObject() : nullptr;
    if (!object)
        return false;
    const QByteArray latinName = name.toLatin1();
    if (object->inherits(latinName.constData()))
        return true;
    for (const QMetaObject *meta = object->metaObject()->superClass(); meta; meta = meta->superClass()) {
        if (latinName == meta->className())
            return true;
    }
    return false;
}

QString Loomkit::objectToString(QObject *object)
{
    if (!object)
        return QStringLiteral("null");

    const QMetaObject *metaObject = object->metaObject();
    qCDebug(lcCore) << "static className" << metaObject->className();
    for (int i = 0; i < metaObject->propertyCount(); ++i) {
        const QMetaProperty property = metaObject->property(i);
        qCDebug(lcCore) << "property" << property.name() << "typeName" << property.typeName()
                        << "isEnumType" << property.isEnumType();
    }
    for (int i = 0; i < metaObject->methodCount(); ++i)
        qCDebug(lcCore) << "method" << "signature" << metaObject->method(i).methodSignature();
    QString indent;
    for (const QMetaObject *meta = metaObject; meta; meta = meta->superClass()) {
        qCDebug(lcCore).noquote() << indent + QLatin1String("metaObject className") << meta->className();
        indent += QLatin1String("  ");
    }
    return QString();
}

// Window capture

QImage Loomkit::grabWindowImage(const QRect &rect) const
{
    QQuickWindow *quickWindow = window();
    if (!quickWindow)
        return QImage();
    QImage image = quickWindow->grabWindow();
    if (!rect.isEmpty() && !rect.isNull())
        image = image.copy(rect);
    return image;
}

bool Loomkit::grabWindowToClipboard(const QRect &rect)
{
    QClipboard *clipboard = QGuiApplication::clipboard();
    if (!clipboard) {
        qCCritical(lcCore) << Q_FUNC_INFO << "Null clipboard";
        return false;
    }
    const QImage image = grabWindowImage(rect);
    if (!image.isNull())
        clipboard->setImage(image, QClipboard::Clipboard);
    return !image.isNull();
}

bool Loomkit::grabWindowToClipboard()
{
    return grabWindowToClipboard(QRect());
}

bool Loomkit::grabWindowToFile(const QString &path, const QRect &rect)
{
    const QImage image = grabWindowImage(rect);
    if (image.isNull())
        return false;
    return image.save(FileUtility::resolvedPath(path, true));
}

bool Loomkit::grabWindowToFile(const QString &path)
{
    return grabWindowToFile(path, QRect());
}

// Translations

void Loomkit::loadTranslator(const QJSValue &translations, const QString &appFolderPath,
                             const QString &locale, bool retranslate)
{
    QCoreApplication *app = QCoreApplication::instance();
    if (!app)
        return;
    const QVariant property = app->property("Orvane.Loomkit.TranslatorManager");
    if (!property.isValid() || property.isNull() || !property.canConvert<QObject *>())
        return;
    QObject *manager = property.value<QObject *>();
    if (!manager)
        return;

    QMetaObject::invokeMethod(manager, "loadTranslator",
                              Q_ARG(QVariant, translations.toVariant()),
                              Q_ARG(QString, appFolderPath),
                              Q_ARG(QString, locale));
    if (retranslate) {
        if (QQmlEngine *qmlEngine = engine())
            qmlEngine->retranslate();
    }
}

// Key injection

QQuickItem *Loomkit::keyTarget(QQuickItem *item, const char *function, const QJSValue &key) const
{
    if (item)
        return item;
    item = qobject_cast<QQuickItem *>(QGuiApplication::focusObject());
    if (!item)
        qCWarning(lcCore) << function << "No target item:" << "key:" << key.toString();
    return item;
}

void Loomkit::sendKeyPressAndRelease(QQuickItem *item, int key, int modifiers, const QString &text)
{
    const QString pressText = text.isNull()
        ? QKeySequence(key).toString(QKeySequence::PortableText)
        : text;
    QKeyEvent press(QEvent::KeyPress, key, Qt::KeyboardModifiers(modifiers), pressText, false, 1);
    QCoreApplication::sendEvent(item, &press);
    QKeyEvent release(QEvent::KeyRelease, key, Qt::KeyboardModifiers(modifiers), QString(), false, 1);
    QCoreApplication::sendEvent(item, &release);
}

void Loomkit::sendKey(const QJSValue &key, QQuickItem *item)
{
    item = keyTarget(item, Q_FUNC_INFO, key);
    if (!item)
        return;
    if (key.isNull() || key.isUndefined())
        return;

    if (key.isString()) {
        const QString text = key.toString();
        for (const QChar c : text)
            sendKeyPressAndRelease(item, c.toUpper().unicode(), 0, QString(c));
    } else if (key.isArray()) {
        const int length = key.property(QStringLiteral("length")).toInt();
        for (int i = 0; i < length; ++i)
            sendKey(key.property(quint32(i)), item);
    } else if (key.isObject() && !key.isQObject()) {
        const QVariantMap map = key.toVariant().toMap();
        const int code = map.value(QStringLiteral("key"), int(Qt::Key_unknown)).toInt();
        const int modifiers = map.value(QStringLiteral("modifiers"), 0).toInt();
        const QVariant text = map.value(QStringLiteral("text"));
        sendKeyPressAndRelease(item, code, modifiers, text.isValid() ? text.toString() : QString());
    } else if (key.isNumber()) {
        sendKeyPressAndRelease(item, key.toInt(), 0, QString());
    } else {
        qCWarning(lcCore) << Q_FUNC_INFO << "Unexpected key:" << key.toString();
    }
}

void Loomkit::sendKey(const QJSValue &key)
{
    sendKey(key, nullptr);
}

void Loomkit::sendStandardKey(const QJSValue &key, QQuickItem *item)
{
    item = keyTarget(item, Q_FUNC_INFO, key);
    if (!item)
        return;
    if (key.isNull() || key.isUndefined())
        return;

    QKeySequence sequence;
    if (key.isString()) {
        sequence = QKeySequence(key.toString());
    } else if (key.isNumber()) {
        sequence = QKeySequence(QKeySequence::StandardKey(key.toInt()));
    } else if (key.isArray()) {
        const int length = key.property(QStringLiteral("length")).toInt();
        for (int i = 0; i < length; ++i)
            sendStandardKey(key.property(quint32(i)), item);
        return;
    } else {
        qCWarning(lcCore) << Q_FUNC_INFO << "Unexpected standard key:" << key.toString();
        return;
    }

    for (int i = 0; i < sequence.count(); ++i) {
        const int element = sequence[uint(i)];
        sendKeyPressAndRelease(item, element & kKeyMask, element & kModifierMask, QLatin1String(""));
    }
}

void Loomkit::sendStandardKey(const QJSValue &key)
{
    sendStandardKey(key, nullptr);
}

// Platform

bool Loomkit::isAppInstalled(const QString &appIdentifier)
{
    return m_appUtils->isAppInstalled(appIdentifier);
}

bool Loomkit::isAppInstalled(const QStringList &appIdentifierValues)
{
    for (const QString &identifier : appIdentifierValues) {
        if (m_appUtils->isAppInstalled(identifier))
            return true;
    }
    return false;
}

// Files, folders, storage and the environment

FileFolder *Loomkit::userHomeFolder()
{
    // A new object at each read, as a property value: no parent, and the
    // engine does not take it over.
    return new FileFolder(userHomePath());
}

FileFolder *Loomkit::temporaryFolder() const
{
    return new FileFolder(QDir::temp());
}

StandardPaths *Loomkit::standardPaths()
{
    if (!m_standardPaths)
        m_standardPaths = new StandardPaths(this);
    return m_standardPaths;
}

Environment *Loomkit::environment()
{
    if (!m_environment)
        m_environment = new Environment(this);
    return m_environment;
}

namespace {

template <typename T>
T *scriptOwned(T *object)
{
    QQmlEngine::setObjectOwnership(object, QQmlEngine::JavaScriptOwnership);
    return object;
}

} // namespace

File *Loomkit::file(const QString &path)
{
    return scriptOwned(new File(path));
}

File *Loomkit::file(const QUrl &pathUrl)
{
    return scriptOwned(new File(pathUrl));
}

FileFolder *Loomkit::fileFolder(const QString &path)
{
    return scriptOwned(new FileFolder(path));
}

FileFolder *Loomkit::fileFolder(const QUrl &pathUrl)
{
    return scriptOwned(new FileFolder(pathUrl));
}

FileInfo *Loomkit::fileInfo(const QString &path)
{
    return scriptOwned(new FileInfo(path));
}

FileInfo *Loomkit::fileInfo(const QUrl &pathUrl)
{
    return scriptOwned(new FileInfo(pathUrl));
}
