#ifndef TEXTENCODING_H
#define TEXTENCODING_H

// How text becomes bytes and back. Classes that expose an encoding to QML
// (File, BinaryData) declare a copy of this enum with the same values.
enum TextEncoding {
    TextEncodingUnknown = -1,
    TextEncodingUtf8 = 0,
    TextEncodingLatin1 = 1,
    TextEncodingLocal8Bit = 2,
    TextEncodingUtf16 = 3
};

#endif // TEXTENCODING_H
