#pragma once

#include <QString>

// Reports an internal consistency fault as "file(line): message" through qWarning. Nothing is
// shown to the user; the caller skips the failed operation or answers with a safe fallback.
void rkSourceWarning(const char* file, int line, const QString& message);

#define RK_SOURCE_WARNING(message) rkSourceWarning(__FILE__, __LINE__, (message))
