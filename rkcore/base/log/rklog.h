#pragma once

#include "rkcoreglobal.h"

#include <QString>

#include <functional>

// The host's log, usable from every layer. A line goes to the handler that the application
// installed (it keeps the lines, shows them and writes them to stderr), or to qWarning while there
// is none.
using RkLogHandler = std::function<void(const QString& line)>;

RKCORE_EXPORT void rkLog(const QString& line);
// Installs the handler and returns the one it replaces; an empty handler restores qWarning.
RKCORE_EXPORT RkLogHandler rkSetLogHandler(RkLogHandler handler);
