// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakePowerSourcesInfo.h"
#include "TestEnvironment.h"

#include "core/files/Paths.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/services/PowerSourcesInfo.h"
#include "core/services/Services.h"

#include <QDir>
#include <QFile>
#include <QProcess>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;

namespace {
void write(const QString &path, const QByteArray &text)
{
    QDir().mkpath(QFileInfo(path).absolutePath());
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly)) {
        qFatal("cannot write %s", qPrintable(path));
    }
    file.write(text);
}
} // namespace

/// The same questions of sysfs (a tree under CADENZA_ROOT) and of the fake.
class PowerSourcesTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init() { m_environment = std::make_unique<Testing::TestEnvironment>(); }
    void cleanup() { m_environment.reset(); }

    void mainsBatteryAndNothing_data()
    {
        QTest::addColumn<bool>("useSysfs");
        QTest::newRow("sysfs") << true;
        QTest::newRow("fake") << false;
    }
    void mainsBatteryAndNothing()
    {
        QFETCH(bool, useSysfs);
        auto fake = std::make_shared<FakePowerSourcesInfo>();
        const QString supplies = Paths::root() + QStringLiteral("/sys/class/power_supply");
        auto scenario = [&](const QString &mains, const QString &battery) {
            if (useSysfs) {
                QDir(supplies).removeRecursively();
                if (!mains.isEmpty()) {
                    write(supplies + QStringLiteral("/AC/type"), "Mains\n");
                    write(supplies + QStringLiteral("/AC/online"), mains.toLatin1() + '\n');
                    write(supplies + QStringLiteral("/BAT0/type"), "Battery\n");
                    write(supplies + QStringLiteral("/BAT0/status"), battery.toLatin1() + '\n');
                    write(
                        supplies + QStringLiteral("/hid-mouse/type"), "Battery\n"); // a peripheral: no status
                }
                Services::setPowerSources(nullptr);
            } else {
                if (mains.isEmpty()) {
                    fake->setPowerSources(std::nullopt);
                } else {
                    fake->setPowerSources(QList<QVariantMap> {
                        {{PowerSourcesInfo::StateKey,
                            mains == u"1" ? PowerSourcesInfo::ACPower : PowerSourcesInfo::OffLine}},
                        {{PowerSourcesInfo::StateKey,
                            battery == u"Discharging" ? PowerSourcesInfo::BatteryPower
                                                      : PowerSourcesInfo::ACPower}}});
                }
                Services::setPowerSources(fake);
            }
        };
        CZSpeechInstallationManager manager;
        scenario(QStringLiteral("1"), QStringLiteral("Charging"));
        QVERIFY(manager.isRunningOnACPower());
        scenario(QStringLiteral("0"), QStringLiteral("Discharging"));
        QVERIFY(!manager.isRunningOnACPower());
        scenario(QStringLiteral("0"), QStringLiteral("Full"));
        QVERIFY(manager.isRunningOnACPower());
        scenario(QString(), QString()); // no power information at all: a desktop, on mains
        QVERIFY(manager.isRunningOnACPower());
    }

    void theCommandSaysSo()
    {
        const QString supplies = Paths::root() + QStringLiteral("/sys/class/power_supply");
        write(supplies + QStringLiteral("/AC/type"), "Mains\n");
        write(supplies + QStringLiteral("/AC/online"), "0\n");
        write(supplies + QStringLiteral("/BAT0/type"), "Battery\n");
        write(supplies + QStringLiteral("/BAT0/status"), "Discharging\n");
        QProcess cadenza;
        cadenza.start(QStringLiteral(CADENZA_CLI_PATH), {QStringLiteral("power")});
        QVERIFY(cadenza.waitForFinished(20000));
        QCOMPARE(cadenza.readAllStandardOutput(), QByteArray("Battery Power\n"));
    }

private:
    std::unique_ptr<Testing::TestEnvironment> m_environment;
};

QTEST_GUILESS_MAIN(PowerSourcesTest)
#include "tst_powersources.moc"
