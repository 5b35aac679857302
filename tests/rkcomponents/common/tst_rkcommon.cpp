#include "rkassertcast.h"
#include "rksourcewarning.h"
#include "rktestmain.h"
#include "rktoolpane.h"
#include "rktoolpaneaction.h"

namespace
{
QStringList warnings;

void collect(QtMsgType type, const QMessageLogContext&, const QString& message)
{
    if (type == QtWarningMsg)
        warnings.append(message);
}
} // namespace

class TestRkCommon : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void sourceWarning();
    void assertCast();
};

void TestRkCommon::sourceWarning()
{
    warnings.clear();
    QtMessageHandler previous = qInstallMessageHandler(collect);
    rkSourceWarning("rkezpropertiescontrol.cpp", 212,
                    QStringLiteral("Undo Stack already being held in "
                                   "RkEzPropertiesControl::editStart()!"));
    RK_SOURCE_WARNING(QStringLiteral("here"));
    const int line = __LINE__ - 1;
    qInstallMessageHandler(previous);
    QCOMPARE(warnings.size(), 2);
    QCOMPARE(warnings.at(0), QStringLiteral("rkezpropertiescontrol.cpp(212): Undo Stack already "
                                            "being held in RkEzPropertiesControl::editStart()!"));
    QVERIFY(warnings.at(1).endsWith(QStringLiteral("tst_rkcommon.cpp(%1): here").arg(line)));
}

void TestRkCommon::assertCast()
{
    QCOMPARE(rkAssertCast<RkToolPane>(nullptr), static_cast<RkToolPane*>(nullptr));
    RkToolPane pane;
    QObject* asObject = &pane;
    QCOMPARE(rkAssertCast<RkToolPane>(asObject), &pane);
    QCOMPARE(rkAssertCast<RkPane>(asObject), static_cast<RkPane*>(&pane));

    RkToolPaneAction action;
    QString thrown;
    try {
        rkAssertCast<RkToolPane>(&action);
    } catch (const QString& message) {
        thrown = message;
    }
    QCOMPARE(thrown, QStringLiteral("Failure to cast RkAssertCast"));
}

RK_TEST_MAIN(TestRkCommon)
#include "tst_rkcommon.moc"
