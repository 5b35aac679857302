// Feeds arbitrary bytes to the scene loader. The checksum is not verified, so the fuzzer reaches
// the structure checks behind it. Whatever loads is deleted again; nothing may crash or leak.
#include "app/rkapp.h"
#include "demo/rkdemoscene.h"
#include "scene/rkscene.h"
#include "scene/rkscenefile.h"

#include <QApplication>

#include <cstdint>
#include <cstdlib>

namespace
{
QApplication* application = nullptr;
RkApp* core = nullptr;
} // namespace

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv)
{
    setenv("QT_QPA_PLATFORM", "offscreen", 0);
    application = new QApplication(*argc, *argv);
    core = new RkApp;
    // Refused values are logged; the fuzzer does not need to see them.
    qInstallMessageHandler([](QtMsgType, const QMessageLogContext&, const QString&) {});
    // RK_FUZZ_SEED=<file> writes the demo scene there, a good first entry of a corpus.
    const QString seed = qEnvironmentVariable("RK_FUZZ_SEED");
    if (!seed.isEmpty()) {
        rkBuildDemoScene(rkScene);
        const bool saved = rkScene->save(seed);
        rkScene->clear();
        if (!saved)
            return 1;
    }
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    RkSceneReader reader;
    reader.setVerifyChecksum(false);
    if (reader.read(QByteArray(reinterpret_cast<const char*>(data), int(size)))) {
        const RkNodeList nodes = reader.takeNodes();
        reader.postLoad();
        qDeleteAll(nodes);
    }
    return 0;
}
