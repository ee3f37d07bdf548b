#include <QCoreApplication>
#include <QTemporaryDir>

#include <gtest/gtest.h>

// The settings library looks for its directory once, so that it must be set before all tests.
int main(int argc, char** argv)
{
    const QTemporaryDir configuration;
    qputenv("XDG_CONFIG_HOME", configuration.path().toUtf8());
    qunsetenv("DBUS_SESSION_BUS_ADDRESS");
    qunsetenv("XDG_RUNTIME_DIR");
    ::testing::InitGoogleTest(&argc, argv);
    const QCoreApplication application(argc, argv);
    const int result = RUN_ALL_TESTS();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    return result;
}
