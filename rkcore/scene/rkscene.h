#pragma once

#include "rkcoreglobal.h"

#include <QObject>

// The scene: its nodes, the selection and time. Owned by RkApp; rkScene points at it.
class RKCORE_EXPORT RkScene : public QObject {
    Q_OBJECT
public:
    explicit RkScene(QObject* parent = nullptr);
    ~RkScene() override;
};

RKCORE_EXPORT extern RkScene* rkScene;
