#pragma once

class QScriptEngine;

// Lets scripts drive the scene. Installs these globals in the engine:
//   scene      getNumNodes(), getNode(index), findNode(nameOrLabel), selectNode(nameOrNode, add),
//              clearSelection(), getPrimarySelection(), load(path), save(path),
//              importFile(path), lastError
//   undoStack  undo(), redo(), getUndoCaption(), count()
//   wait(ms)   runs the event loop for ms milliseconds
// Nodes reach scripts with name, label and findProperty(nameOrLabel); properties with name,
// label, value, min, max and hidden. Each assignment to a property's value goes through the
// property's own setter (clamping included) and is one undo entry captioned with the label.
// Scripts hold nodes and properties through watching adaptors: once the node or property is
// deleted they read undefined and writes do nothing.
void rkInstallScriptSurface(QScriptEngine* engine);
