#include "widgets/rkwidgetclasses.h"

#include "plugin/rkclassfactory.h"
#include "plugin/rkguid.h"
#include "widgets/rkboolpropertywgt.h"
#include "widgets/rkfloatpropertywgt.h"
#include "widgets/rkintpropertywgt.h"

namespace
{
template <typename T> class WidgetClassFactory : public RkClassFactory
{
public:
    explicit WidgetClassFactory(const char* guid)
        : RkClassFactory(&T::staticMetaObject, RkGUID::fromString(QLatin1String(guid)))
    {
    }
    QObject* createInstance() override { return new T; }
};
} // namespace

QList<RkClassFactory*> rkWidgetClassFactories()
{
    static WidgetClassFactory<RkFloatPropertyWgt> floatWgt("72c03f5d-7948-44ea-861e-db1424b31840");
    static WidgetClassFactory<RkIntPropertyWgt> intWgt("09379d8d-8b88-4cca-97f6-c3458daa9424");
    static WidgetClassFactory<RkBoolPropertyWgt> boolWgt("8a493f0a-19cd-437d-96fd-4d11bd20ceb3");
    return {&floatWgt, &intWgt, &boolWgt};
}
