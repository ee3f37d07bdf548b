// slow-end: a program whose orderly end takes 3 s; it tells on standard output when it has come to
// what, and how often it was asked.
#include "Platform/Linux/TerminationSignals.h"

#include <QCoreApplication>

#include <cstdio>

#include <unistd.h>

int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    const ventrik::TerminationSignals termination([] {
        std::puts("asked");
        std::fflush(stdout);
        QCoreApplication::quit();
    });
    std::puts("running");
    std::fflush(stdout);
    const int status = QCoreApplication::exec();
    sleep(3);
    std::puts("ended");
    return status;
}
