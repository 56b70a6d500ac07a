// Canvases and images need a QGuiApplication.  The tests make one on first
// use and keep it until the process ends, as a host would.
#pragma once

#include <QGuiApplication>

inline void MakeGuiApplication()
{
    static int argc = 1;
    static char name[] = "velm-widgets-test";
    static char *argv[] = {name, nullptr};
    static auto *application = new QGuiApplication(argc, argv);
    (void)application;
}
