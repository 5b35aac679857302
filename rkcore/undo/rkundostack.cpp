#include "rkundostack.h"

RkUndoStack* rkUndoStack = nullptr;

RkUndoStack::RkUndoStack(QObject* parent) : QObject(parent) {}

RkUndoStack::~RkUndoStack() = default;
