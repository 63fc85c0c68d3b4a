#!/bin/sh
# Installs every Debian 12 package that the build, the tests, the demo and the
# benchmarks need. Quick and silent when everything is present already.
set -e
PACKAGES="
 build-essential cmake pkg-config ninja-build
 qtbase5-dev qtdeclarative5-dev qtdeclarative5-dev-tools qttools5-dev qttools5-dev-tools
 qtpositioning5-dev libqt5svg5-dev
 qml-module-qtquick2 qml-module-qtquick-window2 qml-module-qtquick-layouts
 qml-module-qtquick-controls2 qml-module-qttest qml-module-qtqml-models2
 qml-module-qt-labs-folderlistmodel
 qt5-image-formats-plugins
 zlib1g-dev libminizip-dev
 zip unzip libimage-exiftool-perl exiv2
 python3 python3-xmltodict python3-pycryptodome curl openssl libssl-dev rsyslog
 clang libclang-rt-14-dev
"
missing=""
for p in $PACKAGES; do
    dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing="$missing $p"
done
[ -z "$missing" ] && exit 0
SUDO=""
[ "$(id -u)" -eq 0 ] || SUDO=sudo
export DEBIAN_FRONTEND=noninteractive
$SUDO apt-get update -qq
$SUDO apt-get install -y -qq --no-install-recommends $missing >/dev/null
