#pragma once

class RkViewportMgr;
class RkActionMgr;

// The host's viewport tools: "Universal" (options widget and an options menu that changes when
// its "Advanced Options" box is ticked), "Translate" (options widget, no menu) and "Orbit Camera"
// (neither). Adds the actions their menus name to the action manager first.
void rkAddDemoTools(RkViewportMgr* viewportMgr, RkActionMgr* actionMgr);
