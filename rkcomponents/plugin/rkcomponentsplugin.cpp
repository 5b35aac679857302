#include "rkcomponentsplugin.h"

#include "plugin/rkplugin.h"
#include "rkezmixer.h"
#include "rkezmixercontrol.h"
#include "rkezmixerdriver.h"
#include "rkezmixers.h"
#include "rkezpropertiespane.h"
#include "rkezpropertiespaneaction.h"
#include "rkfavoritesaddaction.h"
#include "rkfavoritesremoveaction.h"
#include "rkfullscreenaction.h"
#include "rkfullscreenactionfactory.h"
#include "rkglobalfavoritesaddaction.h"
#include "rkglobalfavoritesremoveaction.h"
#include "rkmouseoverslideraction.h"
#include "rkpropertiespane.h"
#include "rkpropertiespaneaction.h"
#include "rkshowhiddenpropaction.h"
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
RK_NAMED_FACTORY(RkPropertiesPane, "48B0C8BC-C2BB-4dcd-9D1F-C9B00FCB3198")
RK_NAMED_FACTORY(RkPropertiesPaneAction, "BBC2D2EB-CA2F-45d2-B7F2-CA06A7ECE1BD")
RK_NAMED_FACTORY(RkShowHiddenPropAction, "3239CB73-3DF6-4051-B2E3-FEA43957DC4A")

RK_NAMED_FACTORY(RkUVView, "FF850F0D-617B-4717-93BF-7CF68542C829")
RK_NAMED_FACTORY(RkUVViewAction, "98DD6C5E-D2CF-4dc1-B5D2-D2EBE73D274B")
RK_NAMED_FACTORY(RkFavoritesRemoveAction, "CB35947A-1569-4181-B5C8-2B78A73A013A")
RK_NAMED_FACTORY(RkFavoritesAddAction, "AAADFD59-6680-47d6-95B9-C99FA19688D8")
RK_NAMED_FACTORY(RkMouseOverSliderAction, "01eaf994-480e-49db-92cb-12676a2bc3c7")
RK_NAMED_FACTORY(RkGlobalFavoritesRemoveAction, "49DB83F8-4E8D-4ea2-AFCF-00EE915F50FB")
RK_NAMED_FACTORY(RkGlobalFavoritesAddAction, "81652106-201A-46f8-947D-81822E612BC8")

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
