#pragma once

class RkMainWindow;

// The host's own actions (File > Quit, Help > About Plug-ins), given to the action manager.
void rkAddHostActions(RkMainWindow* mainWindow);
