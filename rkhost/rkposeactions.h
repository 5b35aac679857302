#pragma once

class RkMainWindow;

// The figure and selection commands (Memorize, Restore, Zero, Clear Animation, Limits, Lock,
// Symmetry, Move to Floor), given to the action manager; the Parameters tab lists them in its
// options menu by class name, the Figure menu holds them too.
void rkAddPoseActions(RkMainWindow* mainWindow);
