#pragma once

#include "rkcoreglobal.h"

#include <QObject>

// The application's undo stack. Owned by RkApp; rkUndoStack points at it.
class RKCORE_EXPORT RkUndoStack : public QObject {
    Q_OBJECT
public:
    explicit RkUndoStack(QObject* parent = nullptr);
    ~RkUndoStack() override;
};

RKCORE_EXPORT extern RkUndoStack* rkUndoStack;
