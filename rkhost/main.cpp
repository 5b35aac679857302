#include "rkapp.h"

#include <QApplication>

int main(int argc, char** argv)
{
    QApplication app(argc, argv);
    RkApp core;
    return 0;
}
