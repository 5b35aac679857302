#include "log/rklog.h"

#include <utility>

namespace
{
RkLogHandler& currentHandler()
{
    static RkLogHandler handler;
    return handler;
}
} // namespace

void rkLog(const QString& line)
{
    if (const RkLogHandler& handler = currentHandler())
        handler(line);
    else
        qWarning("%s", qPrintable(line));
}

RkLogHandler rkSetLogHandler(RkLogHandler handler)
{
    return std::exchange(currentHandler(), std::move(handler));
}
