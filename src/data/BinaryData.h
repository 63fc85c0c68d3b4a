#ifndef BINARYDATA_H
#define BINARYDATA_H

#include <QByteArray>
#include <QJSValue>
#include <QObject>
#include <QVariant>

// A byte buffer for QML: typed access at byte offsets, and text, Base64 and
// hexadecimal views of the same bytes.
class BinaryData : public QObject
{
    Q_OBJECT

    Q_PROPERTY(bool isNull READ isNull NOTIFY sizeChanged)
    Q_PROPERTY(bool isEmpty READ isEmpty NOTIFY sizeChanged)
    Q_PROPERTY(int size READ size WRITE setSize NOTIFY sizeChanged)
    Q_PROPERTY(QVariant data READ data WRITE setData NOTIFY dataChanged)
    Q_PROPERTY(TextEncoding textEncoding READ textEncoding WRITE setTextEncoding NOTIFY textEncodingChanged)
    Q_PROPERTY(QString base64 READ base64 WRITE setBase64 NOTIFY dataChanged)
    Q_PROPERTY(QString hex READ hex WRITE setHex NOTIFY dataChanged)

public:
    // Same values as the module-wide TextEncoding.
    enum TextEncoding {
        TextEncodingUnknown = -1,
        TextEncodingUtf8 = 0,
        TextEncodingLatin1 = 1,
        TextEncodingLocal8Bit = 2,
        TextEncodingUtf16 = 3
    };
    Q_ENUM(TextEncoding)

    // The values are Qt metatype ids, so QMetaType::sizeOf gives the width.
    enum Type {
        TypeUInt8 = 37,
        TypeInt8 = 34,
        TypeUInt16 = 36,
        TypeInt16 = 33,
        TypeUInt32 = 3,
        TypeInt32 = 2,
        TypeUInt64 = 5,
        TypeInt64 = 4,
        TypeSingle = 38,
        TypeDouble = 6
    };
    Q_ENUM(Type)

    // Any value but 1 swaps bytes.
    enum ByteOrder {
        LittleEndian = 1,
        BigEndian = 0,
        PlatformByteOrder = 1
    };
    Q_ENUM(ByteOrder)

    explicit BinaryData(QObject *parent = nullptr);

    // Unparented objects in JavaScript ownership.
    static BinaryData *create(const QByteArray &data);
    static BinaryData *create(const QJSValue &value, TextEncoding encoding = TextEncodingUtf8);

    // The bytes of a value handed over by script: a BinaryData object, an
    // ArrayBuffer or byte array, or text in the given encoding. Anything else
    // gives false and leaves bytes alone.
    static bool toBytes(const QVariant &value, QByteArray *bytes, TextEncoding encoding = TextEncodingUtf8);

    bool isNull() const;
    bool isEmpty() const;
    int size() const;
    void setSize(int size);
    QVariant data() const;
    void setData(const QVariant &data);
    TextEncoding textEncoding() const;
    void setTextEncoding(TextEncoding encoding);
    QString base64() const;
    void setBase64(const QString &base64);
    QString hex() const;
    void setHex(const QString &hex);

    const QByteArray &bytes() const { return m_data; }
    void setBytes(const QByteArray &bytes);

    Q_INVOKABLE void clear();
    Q_INVOKABLE QJSValue dataAt(int offset, Type type = TypeUInt8, ByteOrder byteOrder = LittleEndian) const;
    Q_INVOKABLE int setDataAt(int index, const QJSValue &value, Type type = TypeUInt8,
                              ByteOrder byteOrder = LittleEndian);
    Q_INVOKABLE void fill(int byteValue, int size = -1);
    Q_INVOKABLE QString stringData(TextEncoding encoding) const;
    Q_INVOKABLE QString stringData() const;
    Q_INVOKABLE void setStringData(const QString &string, TextEncoding encoding);
    Q_INVOKABLE void setStringData(const QString &string);

signals:
    void sizeChanged();
    void dataChanged();
    void textEncodingChanged();

private:
    void replace(const QByteArray &bytes);
    void replaceDecoded(const QByteArray &bytes);

    QByteArray m_data;
    TextEncoding m_textEncoding = TextEncodingUtf8;
};

#endif // BINARYDATA_H
