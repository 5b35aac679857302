#pragma once

#include <QtGlobal>

// Every class and global the host core library shares with the host and its modules carries this
// mark; modules are built with hidden visibility and must still see these symbols.
#if defined(RKCORE_LIBRARY)
#define RKCORE_EXPORT Q_DECL_EXPORT
#else
#define RKCORE_EXPORT Q_DECL_IMPORT
#endif
