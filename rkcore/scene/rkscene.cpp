#include "rkscene.h"

RkScene* rkScene = nullptr;

RkScene::RkScene(QObject* parent) : QObject(parent) {}

RkScene::~RkScene() = default;
