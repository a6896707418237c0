// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "MemoryPreferencesStore.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "protocol/InstallerProtocol.h"

#include <QProcess>
#include <QTest>

#include <limits>

using namespace Cadenza;
using namespace Cadenza::Platform;

namespace {
CZSpeechItemPtr item(const QString &locale, qint64 visibility = 0, const QString &bundle = QString())
{
    auto made = CZSpeechItem::initWithDownloadableBundleIdentifier(
        bundle.isEmpty() ? QStringLiteral("b.") + locale : bundle,
        QVariantMap {{QStringLiteral("LocaleIdentifier"), locale}});
    made->setVisibility(visibility);
    return made;
}
QStringList locales(const QList<CZSpeechItemPtr> &items)
{
    QStringList out;
    for (const auto &i : items) {
        out.append(i->localeIdentifier());
    }
    return out;
}
} // namespace

class SpeechItemTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<Testing::TestEnvironment>();
        m_locale = std::make_shared<FakeUserLocaleService>();
        m_speech = std::make_shared<FakeSpeechSynthesisService>();
        Services::setUserLocale(m_locale);
        Services::setSpeechSynthesis(m_speech);
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        SpeechItemPrivate::resetConversionLocale();
    }
    void cleanup()
    {
        SpeechItemPrivate::resetConversionLocale();
        m_environment.reset();
    }

    void sameLocale_data()
    {
        QTest::addColumn<QString>("a");
        QTest::addColumn<QString>("b");
        QTest::addColumn<bool>("sameLocale");
        QTest::addColumn<bool>("sameLanguage");
        QTest::newRow("country on one side") << "en"
                                             << "en_US" << false << true;
        QTest::newRow("case of the language") << "en"
                                              << "EN" << true << true;
        QTest::newRow("case of the country") << "en_US"
                                             << "en_us" << true << true;
        QTest::newRow("scripts ignored") << "zh_Hans_CN"
                                         << "zh_CN" << true << true;
        QTest::newRow("tags") << "en-GB"
                              << "en_GB" << true << true;
        QTest::newRow("other country") << "en_GB"
                                       << "en_US" << false << true;
        QTest::newRow("other language") << "de_DE"
                                        << "en_DE" << false << false;
        QTest::newRow("no language") << ""
                                     << "" << false << false;
        QTest::newRow("null") << QString() << "en" << false << false;
    }
    void sameLocale()
    {
        QFETCH(QString, a);
        QFETCH(QString, b);
        QFETCH(bool, sameLocale);
        QFETCH(bool, sameLanguage);
        QCOMPARE(CZSpeechItem::isSameLocaleIdentifier(a, b), sameLocale);
        QCOMPARE(CZSpeechItem::isSameLocaleIdentifier(b, a), sameLocale);
        QCOMPARE(CZSpeechItem::isSameLangaugeFromLocaleIdentifier(a, b), sameLanguage);
    }

    void containment()
    {
        QVERIFY(CZSpeechItem::isLocaleIdentifier(
            QStringLiteral("en-us"), {QStringLiteral("fr"), QStringLiteral("en_US")}));
        QVERIFY(!CZSpeechItem::isLocaleIdentifier(QStringLiteral("en"), {QStringLiteral("en_US")}));
        QCOMPARE(CZSpeechItem::normalizedLocaleIdentifier(QStringLiteral("de-DE")), QStringLiteral("de_DE"));
    }

    void visibleItems()
    {
        const auto us = item(QStringLiteral("en_US"));
        const auto gb = item(QStringLiteral("en_GB"));
        const auto de = item(QStringLiteral("de_DE"));
        const auto fr = item(QStringLiteral("fr_FR"), 1);
        // Nothing visible, nothing of the locale, nothing required: the en_US item alone.
        QCOMPARE(locales(CZSpeechItem::visibleObjectsFromItems({gb, de, us}, QStringLiteral("ja_JP"), {})),
            QStringList {QStringLiteral("en_US")});
        QVERIFY(CZSpeechItem::visibleObjectsFromItems({gb, de}, QStringLiteral("ja_JP"), {}).isEmpty());
        QCOMPARE(
            locales(CZSpeechItem::visibleObjectsFromItems({gb, fr, de, us}, QStringLiteral("de_de"), {})),
            QStringList({QStringLiteral("fr_FR"), QStringLiteral("de_DE")}));
        // Required locales are compared as written.
        QCOMPARE(locales(CZSpeechItem::visibleObjectsFromItems(
                     {gb, de}, QStringLiteral("ja"), {QStringLiteral("en_GB")})),
            QStringList {QStringLiteral("en_GB")});
        QCOMPARE(locales(CZSpeechItem::visibleObjectsFromItems(
                     {gb, de}, QStringLiteral("ja"), {QStringLiteral("en-GB")})),
            QStringList());
    }

    void byteSizes_data()
    {
        QTest::addColumn<quint64>("bytes");
        QTest::addColumn<QString>("english");
        QTest::addColumn<QString>("german");
        QTest::newRow("0") << quint64(0) << "0 bytes"
                           << "0 Byte";
        QTest::newRow("999") << quint64(999) << "999 bytes"
                             << "999 Byte";
        QTest::newRow("1000") << quint64(1000) << "1 KB"
                              << "1 KB";
        QTest::newRow("1499") << quint64(1499) << "1 KB"
                              << "1 KB";
        QTest::newRow("1500") << quint64(1500) << "2 KB"
                              << "2 KB";
        QTest::newRow("999499") << quint64(999499) << "999 KB"
                                << "999 KB";
        QTest::newRow("999500 reads as a thousand") << quint64(999500) << "1,000 KB"
                                                    << "1.000 KB";
        QTest::newRow("1500000") << quint64(1500000) << "2 MB"
                                 << "2 MB";
        QTest::newRow("999500000") << quint64(999500000) << "1,000 MB"
                                   << "1.000 MB";
        QTest::newRow("1500000000") << quint64(1500000000) << "1.5 GB"
                                    << "1,5 GB";
        QTest::newRow("2000000000") << quint64(2000000000) << "2 GB"
                                    << "2 GB";
        QTest::newRow("max") << quint64(18446744073709551615ULL) << "18,446,744,073.7 GB"
                             << "18.446.744.073,7 GB";
    }
    void byteSizes()
    {
        QFETCH(quint64, bytes);
        QFETCH(QString, english);
        QFETCH(QString, german);
        QCOMPARE(CZSpeechItem::displayStringForByteSize(bytes), english);
        m_locale->setPreferredLanguages({QStringLiteral("de_DE")});
        m_locale->setCurrentLocaleIdentifier(QStringLiteral("de_DE"));
        LocalizationTable::resetShared();
        QCOMPARE(CZSpeechItem::displayStringForByteSize(bytes), german);
    }

    void timesRemaining_data()
    {
        QTest::addColumn<double>("seconds");
        QTest::addColumn<QString>("text");
        QTest::newRow("59.9") << 59.9 << "Less than a minute remaining";
        QTest::newRow("119.9") << 119.9 << "Less than a minute remaining";
        QTest::newRow("120") << 120.0 << "About 2 minutes remaining";
        QTest::newRow("179") << 179.0 << "About 2 minutes remaining";
        QTest::newRow("3299") << 3299.0 << "About 54 minutes remaining";
        QTest::newRow("3300") << 3300.0 << "About an hour remaining";
        QTest::newRow("7199") << 7199.0 << "About an hour remaining";
        QTest::newRow("7200") << 7200.0 << "About 2 hours remaining";
        QTest::newRow("10799") << 10799.0 << "About 2 hours remaining";
        QTest::newRow("negative") << -5.0 << "Less than a minute remaining";
        // Times that are no number or absurd: no time, or the formatter's infinity; never garbage.
        QTest::newRow("NaN") << std::numeric_limits<double>::quiet_NaN() << "";
        QTest::newRow("-inf") << -std::numeric_limits<double>::infinity() << "";
        QTest::newRow("-huge") << -1e300 << "Less than a minute remaining";
        QTest::newRow("+inf") << std::numeric_limits<double>::infinity() << "About \u221E hours remaining";
        QTest::newRow("huge") << 1e300 << "About \u221E hours remaining";
        QTest::newRow("beyond qint64 hours") << 3.4e22 << "About \u221E hours remaining";
        QTest::newRow("a century") << 100.0 * 365.25 * 24 * 3600 << "About \u221E hours remaining";
        QTest::newRow("just under a century")
            << 100.0 * 365.25 * 24 * 3600 - 1 << "About 876,599 hours remaining";
    }
    void timesRemaining()
    {
        QFETCH(double, seconds);
        QFETCH(QString, text);
        QCOMPARE(CZSpeechItem::displayStringForTimeRemaining(seconds), text);
    }

    void searchAndTitles()
    {
        const auto us = item(QStringLiteral("en_US"));
        QVERIFY(us->matchesSearchString(QStringLiteral("eng unit")));
        QVERIFY(!us->matchesSearchString(QStringLiteral("nited")));
        QVERIFY(us->matchesSearchString(QString()));
        QVERIFY(us->matchesSearchString(QStringLiteral("   ")));
        QCOMPARE(us->displayTitle(), QStringLiteral("English"));
        us->setShowCountryInDisplayTitle(true);
        QCOMPARE(us->displayTitle(), QStringLiteral("English (United States)"));
        QCOMPARE(item(QStringLiteral("ar"))->countryDisplayString(), QStringLiteral("Saudi Arabia"));
        QCOMPARE(item(QStringLiteral("fr"))->countryDisplayString(), QStringLiteral("French"));
        QCOMPARE(item(QStringLiteral("en_US"))->languageIdentifier(), QStringLiteral("en"));
        QCOMPARE(item(QStringLiteral("en_US"))->countryIdentifier(), QStringLiteral("US"));
    }

    void namesFollowTheHostLanguage()
    {
        m_locale->setPreferredLanguages({QStringLiteral("de_CH")});
        LocalizationTable::resetShared();
        SpeechItemPrivate::resetConversionLocale();
        QCOMPARE(SpeechItemPrivate::_conversionLocale().identifier(), QStringLiteral("de"));
        QCOMPARE(item(QStringLiteral("fr_CA"))->countryDisplayString(), QStringLiteral("Kanada"));
    }

    void systemMatch()
    {
        const auto de = item(QStringLiteral("de_AT"));
        QVERIFY(CZSpeechItem::systemLocaleIdentifier().isNull());
        QVERIFY(!de->doesMatchSystemLocale());
        QVERIFY(!de->isAppropriateForSystemLangauge());
        m_speech->setSpeechLanguageLocale(QStringLiteral("de_DE"));
        QVERIFY(!de->doesMatchSystemLocale());
        QVERIFY(de->isAppropriateForSystemLangauge());
    }

    void orderings()
    {
        const auto a = item(QStringLiteral("fr_FR"), 0, QStringLiteral("a.bundle"));
        const auto b = item(QStringLiteral("de_DE"), 0, QStringLiteral("B.bundle"));
        QVERIFY(a->compare(*b) > 0); // plain comparison: upper case first
        QVERIFY(a->compareLanguageTitle(*b) < 0); // French before German
        QVERIFY(b->compareLanguageTitle(*a) > 0);
        QCOMPARE(a->compareDisplayTitle(*a), 0);
    }

    void catalogueEntriesOfTheWrongTypeCountAsAbsent()
    {
        QVERIFY(!CZSpeechItem::initWithDownloadableBundleIdentifier(
            QStringLiteral("x"), QStringLiteral("not a dictionary")));
        const auto odd = CZSpeechItem::initWithDownloadableBundleIdentifier(QStringLiteral("x"),
            QVariantMap {{QStringLiteral("LocaleIdentifier"), 42},
                {QStringLiteral("ByteSize"), QStringLiteral("12")}, {QStringLiteral("Tag"), QVariantMap()},
                {QStringLiteral("FullSizeByteSize"), qint64(77)},
                {QStringLiteral("Version"), QStringLiteral("2.0")}});
        QVERIFY(odd);
        QVERIFY(odd->localeIdentifier().isNull());
        QCOMPARE(odd->byteSize(), 0u);
        QVERIFY(odd->tagName().isNull());
        QCOMPARE(odd->fullSizeByteSize(), 77u);
        QCOMPARE(odd->version(), QStringLiteral("2.0"));
        QCOMPARE(odd->downloadStatus(), qint64(InstallerProtocol::InstalledStatus));
        QCOMPARE(odd->visibility(), 0);
    }

    void theShippedCatalogueIsLoadedOnce()
    {
        const QVariantMap catalogue = CZSpeechItem::installationDictionaryCache();
        // Voices of several languages, and Tobias in two sizes.
        const QVariantMap voices = catalogue.value(QStringLiteral("DownloadableVoices")).toMap();
        QVERIFY(voices.size() >= 5);
        QVERIFY(voices.contains(QStringLiteral("com.vendra.speech.synthesis.voice.femke.compact")));
        QCOMPARE(voices.value(QStringLiteral("com.vendra.speech.synthesis.voice.tobias.compact"))
                     .toMap()
                     .value(QStringLiteral("FullSizeBundleIdentifier"))
                     .toString(),
            QStringLiteral("com.vendra.speech.synthesis.voice.tobias.premium"));
        // Only languages with a real model are offered: US English.
        QCOMPARE(catalogue.value(QStringLiteral("DownloadableSRLanguages")).toMap().keys(),
            QStringList {QStringLiteral("com.vendra.speech.recognition.en_US")});
    }

    void aLanguageWithoutANameStopsTheProcess()
    {
        QProcess child;
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert(QStringLiteral("CADENZA_TEST_NAMELESS_LANGUAGE"), QStringLiteral("1"));
        child.setProcessEnvironment(environment);
        child.start(QCoreApplication::applicationFilePath(), {});
        QVERIFY(child.waitForFinished(30000));
        QCOMPARE(child.exitStatus(), QProcess::CrashExit);
        QVERIFY(child.readAllStandardError().contains(
            "Language display name is nil for locale: , lang: , for curLocale: en"));
    }

private:
    std::unique_ptr<Testing::TestEnvironment> m_environment;
    std::shared_ptr<FakeUserLocaleService> m_locale;
    std::shared_ptr<FakeSpeechSynthesisService> m_speech;
};

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    if (qEnvironmentVariableIsSet("CADENZA_TEST_NAMELESS_LANGUAGE")) {
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>());
        // An item with no locale at all has no language to name.
        (void)CZSpeechItem::initWithDownloadableBundleIdentifier(QStringLiteral("x"), QVariantMap())
            ->languageDisplayString();
        return 0; // not reached
    }
    SpeechItemTest test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_speechitem.moc"
