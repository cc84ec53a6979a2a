// Force-included into the Qt-free libraries: any Qt header uses these identifiers, so including
// one there stops the build.
#pragma GCC poison QT_BEGIN_NAMESPACE QT_VERSION QT_VERSION_CHECK Q_OBJECT
