// Feeds arbitrary text to the hex and Base64 setters and arbitrary bytes to
// the typed accessors; the encoded views must always decode to the bytes.
#include "BinaryData.h"

#include <QJSValue>

#include <cstdlib>

static const BinaryData::Type kTypes[] = {
    BinaryData::TypeUInt8, BinaryData::TypeInt8, BinaryData::TypeUInt16, BinaryData::TypeInt16,
    BinaryData::TypeUInt32, BinaryData::TypeInt32, BinaryData::TypeUInt64, BinaryData::TypeInt64,
    BinaryData::TypeSingle, BinaryData::TypeDouble,
};

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    if (size < 2)
        return 0;
    const int mode = data[0] % 3;
    const int offset = data[1];
    const QByteArray input(reinterpret_cast<const char *>(data) + 2, int(size - 2));

    BinaryData bytes;
    if (mode == 0)
        bytes.setHex(QString::fromLatin1(input));
    else if (mode == 1)
        bytes.setBase64(QString::fromLatin1(input));
    else
        bytes.setData(input);

    BinaryData viaHex;
    viaHex.setHex(bytes.hex());
    BinaryData viaBase64;
    viaBase64.setBase64(bytes.base64());
    if (viaHex.bytes() != bytes.bytes() || viaBase64.bytes() != bytes.bytes())
        abort();

    for (BinaryData::Type type : kTypes) {
        for (BinaryData::ByteOrder order : { BinaryData::LittleEndian, BinaryData::BigEndian }) {
            const QJSValue value = bytes.dataAt(offset, type, order);
            if (value.isUndefined())
                continue;
            // Integers up to 32 bits survive a write and a read unchanged.
            BinaryData copy;
            copy.setDataAt(0, value, type, order);
            if (type != BinaryData::TypeUInt64 && type != BinaryData::TypeInt64 && type != BinaryData::TypeSingle
                && type != BinaryData::TypeDouble && copy.dataAt(0, type, order).toNumber() != value.toNumber()) {
                abort();
            }
        }
    }

    for (int encoding = -1; encoding <= 3; ++encoding)
        bytes.stringData(BinaryData::TextEncoding(encoding));
    bytes.setDataAt(offset * 7, QJSValue(offset), BinaryData::TypeUInt32);
    bytes.fill(offset, offset);
    return 0;
}
