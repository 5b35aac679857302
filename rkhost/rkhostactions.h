#pragma once

class RkMainWindow;

// The host's own actions (File > Quit, Edit > Flip UVs of Selection, View > 3D View, Help >
// About Plug-ins), given to the action manager.
void rkAddHostActions(RkMainWindow* mainWindow);
