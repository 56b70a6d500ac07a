// The host's part for the Qt tests: one QGuiApplication for the whole run
// (the library never makes its own).  The tests run on the offscreen platform.
#include <QGuiApplication>
#include <QTemporaryDir>

#include <gtest/gtest.h>

namespace {

class QtApplication : public ::testing::Environment {
public:
    void SetUp() override
    {
        static int argc = 1;
        static char name[] = "velm-canvas-test";
        static char *argv[] = {name, nullptr};
        // Qt wants a private runtime folder; test machines often have none.
        if (qEnvironmentVariableIsEmpty("XDG_RUNTIME_DIR") && runtime_.isValid()) {
            qputenv("XDG_RUNTIME_DIR", runtime_.path().toLocal8Bit());
        }
        app_ = new QGuiApplication(argc, argv);
    }
    void TearDown() override { delete app_; }

private:
    QTemporaryDir runtime_;
    QGuiApplication *app_ = nullptr;
};

[[maybe_unused]] ::testing::Environment *const kQtApplication =
    ::testing::AddGlobalTestEnvironment(new QtApplication);

} // namespace
