// Canvases and images need a QGuiApplication.  The tests make one on first
// use and keep it until the process ends, as a host would.
#pragma once

#include <QGuiApplication>
#include <QTemporaryDir>

inline void MakeGuiApplication()
{
    static int argc = 1;
    static char name[] = "velm-widgets-test";
    static char *argv[] = {name, nullptr};
    // Qt wants a private runtime folder and complains on stderr without one.
    static QTemporaryDir runtime;
    if (qEnvironmentVariableIsEmpty("XDG_RUNTIME_DIR") && runtime.isValid()) {
        qputenv("XDG_RUNTIME_DIR", runtime.path().toLocal8Bit());
    }
    static auto *application = new QGuiApplication(argc, argv);
    (void)application;
}
