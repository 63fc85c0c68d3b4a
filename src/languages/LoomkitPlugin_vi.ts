<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="vi">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Hủy</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Chưa cung cấp XML mặc định cho cấu hình ứng dụng.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Không tìm thấy khóa cho com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Mở trong </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Chọn từ các tùy chọn</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Chia sẻ qua</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Nền tảng này không hỗ trợ cấu hình ứng dụng được quản lý thông qua MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Kiểu dữ liệu không được hỗ trợ</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Thao tác không được hỗ trợ</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Nền tảng không được hỗ trợ</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Xem</translation>
    </message>
</context>
</TS>
