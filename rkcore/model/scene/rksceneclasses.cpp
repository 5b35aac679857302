#include "scene/rksceneclasses.h"

#include "plugin/rkclassfactory.h"
#include "plugin/rkguid.h"
#include "scene/rkbone.h"
#include "scene/rkcamera.h"
#include "scene/rklight.h"
#include "scene/rkskeleton.h"

namespace
{
template <typename T> class SceneClassFactory : public RkClassFactory
{
public:
    explicit SceneClassFactory(const char* guid)
        : RkClassFactory(&T::staticMetaObject, RkGUID::fromString(QLatin1String(guid)))
    {
    }
    QObject* createInstance() override { return new T; }
};
} // namespace

QList<RkClassFactory*> rkSceneClassFactories()
{
    static SceneClassFactory<RkNode> node("7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a01");
    static SceneClassFactory<RkSkeleton> skeleton("7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a02");
    static SceneClassFactory<RkBone> bone("7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a03");
    static SceneClassFactory<RkCamera> camera("7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a04");
    static SceneClassFactory<RkLight> light("7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a05");
    return {&node, &skeleton, &bone, &camera, &light};
}
