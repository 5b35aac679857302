#pragma once

// In sanitizer builds, keeps the Mesa OpenGL drivers this process has loaded in memory until it
// ends. The leak checker runs after a driver would otherwise have been unloaded; kept loaded, the
// driver's own leftovers are reported under its name, which the suppressions list, instead of
// under a nameless module. The drivers are found at run time: a throwaway context loads them,
// then the loaded objects are searched for them. Call once, right after the QApplication is
// made. Does nothing in other builds.
//
// Built into the rksupport library that the host and the tests link, not into the core library.
void rkKeepGLDriverLoaded();
