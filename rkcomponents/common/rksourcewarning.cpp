#include "rksourcewarning.h"

#include <QtGlobal>

void rkSourceWarning(const char* file, int line, const QString& message)
{
    const QString text =
        QStringLiteral("%1(%2): %3").arg(QString::fromLocal8Bit(file)).arg(line).arg(message);
    qWarning("%s", text.toLatin1().constData());
}
