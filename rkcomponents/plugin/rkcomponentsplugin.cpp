#include "rkcomponentsplugin.h"

#include "plugin/rkplugin.h"
#include "rkezmixer.h"
#include "rkezmixercontrol.h"
#include "rkezmixerdriver.h"
#include "rkezmixers.h"
#include "rkezpropertiespane.h"
#include "rkezpropertiespaneaction.h"
#include "rkfullscreenaction.h"
#include "rkfullscreenactionfactory.h"
#include "rktclassfactory.h"
#include "rktoolpane.h"
#include "rktoolpaneaction.h"
#include "rkuvview.h"
#include "rkuvviewaction.h"

// Everything here is set up while the module loads, in the order written: the plug-in object
// first, then one factory per class in registration order. The host identifies the classes by
// these GUID strings (stored scenes carry them), so they must never change; they are kept exactly
// as written, case included. Static destruction runs in reverse: the factories from the last to
// the first, the plug-in object after them.

namespace
{

struct ComponentsPlugin : RkPlugin {
    ComponentsPlugin() : RkPlugin(QStringLiteral("Interface Components"), QString(), QString(), 0)
    {
        setAuthor(QStringLiteral("Morvane 3D, Inc"));
        setVersion(0x02000820);
        setDescription(QStringLiteral(
            "This plugin provides the Tool tab, along with other interface components, for "
            "providing options to viewport tools."));
    }
};

ComponentsPlugin s_plugin;

} // namespace

// One named factory per script-enabled class: a static GUID, the factory class and its static
// instance, which adds itself to the plug-in object.
#define RK_NAMED_FACTORY(Class, guidText)                                                          \
    static const RkGUID Class##_GUID = RkGUID::fromString(QStringLiteral(guidText));               \
    class Class##Factory : public RkTClassFactory<Class>                                           \
    {                                                                                              \
    public:                                                                                        \
        Class##Factory() : RkTClassFactory<Class>(&Class::staticMetaObject, Class##_GUID)          \
        {                                                                                          \
            s_plugin.addClassFactory(this);                                                        \
        }                                                                                          \
    };                                                                                             \
    static Class##Factory s_##Class##Factory;

RK_NAMED_FACTORY(RkToolPane, "56C51F21-B8D3-4895-9E00-6C8975018A22")
RK_NAMED_FACTORY(RkToolPaneAction, "255648F4-B646-4dec-B18C-A5FDB71B8C61")

RK_NAMED_FACTORY(RkUVView, "FF850F0D-617B-4717-93BF-7CF68542C829")
RK_NAMED_FACTORY(RkUVViewAction, "98DD6C5E-D2CF-4dc1-B5D2-D2EBE73D274B")

RK_NAMED_FACTORY(RkEzPropertiesPane, "40e0b500-9711-11de-aed8-0002a5d5c51b")
RK_NAMED_FACTORY(RkEzPropertiesPaneAction, "55b5a760-9711-11de-b0b1-0002a5d5c51b")
RK_NAMED_FACTORY(RkEzMixers, "eb3b80e0-bdb1-11de-98b0-0002a5d5c51b")
RK_NAMED_FACTORY(RkEzMixer, "19054e20-bdb2-11de-a0a6-0002a5d5c51b")
RK_NAMED_FACTORY(RkEzMixerControl, "1f6c1960-bdb2-11de-af02-0002a5d5c51b")
RK_NAMED_FACTORY(RkEzMixerDriver, "2578ddc0-bdb2-11de-81d0-0002a5d5c51b")

static const RkGUID RkFullScreenAction_GUID =
    RkGUID::fromString(QStringLiteral("8A77FD58-BE3E-4434-93EF-BB41DA6DBDB4"));
static RkFullScreenActionFactory s_RkFullScreenActionFactory(&RkFullScreenAction::staticMetaObject,
                                                             RkFullScreenAction_GUID);
[[maybe_unused]] static const bool s_RkFullScreenActionAdded =
    (s_plugin.addClassFactory(&s_RkFullScreenActionFactory), true);

RkPlugin* rkComponentsPlugin()
{
    return &s_plugin;
}
