#include "plugin/rkclassfactory.h"
#include "plugin/rkplugin.h"
#include "rktestmain.h"

#include <QFile>

#include <dlfcn.h>
#include <elf.h>

// Every class the module may register, in registration order, with its identifier as stored.
static const struct {
    const char* className;
    const char* guid;
} factoryTable[] = {
    {"RkToolPane", "56C51F21-B8D3-4895-9E00-6C8975018A22"},
    {"RkToolPaneAction", "255648F4-B646-4dec-B18C-A5FDB71B8C61"},
    {"RkPropertiesPane", "48B0C8BC-C2BB-4dcd-9D1F-C9B00FCB3198"},
    {"RkPropertiesPaneAction", "BBC2D2EB-CA2F-45d2-B7F2-CA06A7ECE1BD"},
    {"RkShowHiddenPropAction", "3239CB73-3DF6-4051-B2E3-FEA43957DC4A"},
    {"RkUVView", "FF850F0D-617B-4717-93BF-7CF68542C829"},
    {"RkUVViewAction", "98DD6C5E-D2CF-4dc1-B5D2-D2EBE73D274B"},
    {"RkFavoritesRemoveAction", "CB35947A-1569-4181-B5C8-2B78A73A013A"},
    {"RkFavoritesAddAction", "AAADFD59-6680-47d6-95B9-C99FA19688D8"},
    {"RkMouseOverSliderAction", "01eaf994-480e-49db-92cb-12676a2bc3c7"},
    {"RkGlobalFavoritesRemoveAction", "49DB83F8-4E8D-4ea2-AFCF-00EE915F50FB"},
    {"RkGlobalFavoritesAddAction", "81652106-201A-46f8-947D-81822E612BC8"},
    {"RkEzPropertiesPane", "40e0b500-9711-11de-aed8-0002a5d5c51b"},
    {"RkEzPropertiesPaneAction", "55b5a760-9711-11de-b0b1-0002a5d5c51b"},
    {"RkEzMixers", "eb3b80e0-bdb1-11de-98b0-0002a5d5c51b"},
    {"RkEzMixer", "19054e20-bdb2-11de-a0a6-0002a5d5c51b"},
    {"RkEzMixerControl", "1f6c1960-bdb2-11de-af02-0002a5d5c51b"},
    {"RkEzMixerDriver", "2578ddc0-bdb2-11de-81d0-0002a5d5c51b"},
    {"RkFullScreenAction", "8A77FD58-BE3E-4434-93EF-BB41DA6DBDB4"},
};

// The defined global symbols of an ELF64 shared object's dynamic symbol table.
static QStringList exportedSymbols(const QString& path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return {QStringLiteral("<unreadable>")};
    const QByteArray image = file.readAll();
    auto at = [&](quint64 offset, quint64 size) {
        return offset + size <= quint64(image.size()) ? image.constData() + offset : nullptr;
    };
    auto* header = reinterpret_cast<const Elf64_Ehdr*>(at(0, sizeof(Elf64_Ehdr)));
    if (!header || memcmp(header->e_ident, ELFMAG, SELFMAG) != 0 ||
        header->e_ident[EI_CLASS] != ELFCLASS64)
        return {QStringLiteral("<not ELF64>")};
    auto* sections = reinterpret_cast<const Elf64_Shdr*>(
        at(header->e_shoff, quint64(header->e_shnum) * sizeof(Elf64_Shdr)));
    QStringList names;
    for (int i = 0; sections && i < header->e_shnum; ++i) {
        if (sections[i].sh_type != SHT_DYNSYM || sections[i].sh_link >= header->e_shnum)
            continue;
        const Elf64_Shdr& strtab = sections[sections[i].sh_link];
        auto* symbols =
            reinterpret_cast<const Elf64_Sym*>(at(sections[i].sh_offset, sections[i].sh_size));
        const char* strings = at(strtab.sh_offset, strtab.sh_size);
        for (quint64 k = 0; symbols && strings && k < sections[i].sh_size / sizeof(Elf64_Sym);
             ++k) {
            const Elf64_Sym& s = symbols[k];
            const int binding = ELF64_ST_BIND(s.st_info);
            if (s.st_shndx == SHN_UNDEF || (binding != STB_GLOBAL && binding != STB_WEAK) ||
                s.st_name >= strtab.sh_size)
                continue;
            names.append(QString::fromLatin1(strings + s.st_name));
        }
    }
    names.sort();
    return names;
}

class TestRkComponentsModule : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void cleanupTestCase();
    void entryPoints();
    void factoryTableOrder();
    void onlyTheEntryPointsAreExported();

private:
    void* m_handle = nullptr;
    quint32 (*m_sdkVersion)() = nullptr;
    RkPlugin* (*m_definition)() = nullptr;
};

void TestRkComponentsModule::initTestCase()
{
    m_handle = dlopen(RK_MODULE_FILE, RTLD_NOW | RTLD_LOCAL);
    QVERIFY2(m_handle, dlerror());
    m_sdkVersion = reinterpret_cast<quint32 (*)()>(dlsym(m_handle, "getSDKVersion"));
    m_definition = reinterpret_cast<RkPlugin* (*)()>(dlsym(m_handle, "getPluginDefinition"));
}

void TestRkComponentsModule::cleanupTestCase()
{
    // Unloading runs the module's static tear-down (factories, then the plug-in object).
    if (m_handle)
        QCOMPARE(dlclose(m_handle), 0);
}

void TestRkComponentsModule::entryPoints()
{
    QVERIFY(m_sdkVersion);
    QVERIFY(m_definition);
    // Asked before the definition, and again: always the same version.
    QCOMPARE(m_sdkVersion(), quint32(0x0300013D));
    QCOMPARE(m_sdkVersion(), quint32(0x0300013D));
    RkPlugin* first = m_definition();
    QVERIFY(first);
    QCOMPARE(m_definition(), first);
    QCOMPARE(m_sdkVersion(), quint32(0x0300013D));
}

void TestRkComponentsModule::factoryTableOrder()
{
    const QList<RkClassFactory*> factories = m_definition()->getClassFactories();
    QVERIFY(factories.size() >= 3);
    // Every factory is a row of the table, rows come in table order, GUID text exactly as stored.
    int row = 0;
    QStringList seen;
    for (RkClassFactory* factory : factories) {
        while (row < int(std::size(factoryTable)) &&
               factory->className() != QLatin1String(factoryTable[row].className))
            ++row;
        QVERIFY2(row < int(std::size(factoryTable)),
                 qPrintable(factory->className() + " is out of order or unknown"));
        QCOMPARE(factory->getGUID().toString(), QString::fromLatin1(factoryTable[row].guid));
        seen.append(factory->className());
        ++row;
    }
    // The classes the module has so far; a class added to the module is added here too.
    const QStringList built = {QStringLiteral("RkToolPane"),
                               QStringLiteral("RkToolPaneAction"),
                               QStringLiteral("RkPropertiesPane"),
                               QStringLiteral("RkPropertiesPaneAction"),
                               QStringLiteral("RkShowHiddenPropAction"),
                               QStringLiteral("RkUVView"),
                               QStringLiteral("RkUVViewAction"),
                               QStringLiteral("RkFavoritesRemoveAction"),
                               QStringLiteral("RkFavoritesAddAction"),
                               QStringLiteral("RkMouseOverSliderAction"),
                               QStringLiteral("RkGlobalFavoritesRemoveAction"),
                               QStringLiteral("RkGlobalFavoritesAddAction"),
                               QStringLiteral("RkEzPropertiesPane"),
                               QStringLiteral("RkEzPropertiesPaneAction"),
                               QStringLiteral("RkEzMixers"),
                               QStringLiteral("RkEzMixer"),
                               QStringLiteral("RkEzMixerControl"),
                               QStringLiteral("RkEzMixerDriver"),
                               QStringLiteral("RkFullScreenAction")};
    QCOMPARE(seen, built);
}

void TestRkComponentsModule::onlyTheEntryPointsAreExported()
{
    QCOMPARE(exportedSymbols(QStringLiteral(RK_MODULE_FILE)),
             QStringList({QStringLiteral("getPluginDefinition"), QStringLiteral("getSDKVersion")}));
}

RK_TEST_MAIN(TestRkComponentsModule)
#include "tst_rkcomponentsmodule.moc"
