// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Display-name lookups per second: with the kept ICU handles and answers, and with a fresh ICU handle
// per call (what every lookup costs without the caches), in one run.

#include "BenchTable.h"

#include "core/locale/LocaleDisplayName.h"
#include "core/locale/LocaleDisplayName_p.h"

#include <QCoreApplication>
#include <QStringList>

using namespace Cadenza;
using namespace CadenzaBench;

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const int calls = argc > 1 ? std::atoi(argv[1]) : 20000;
    const QStringList values {QStringLiteral("en_US"), QStringLiteral("de_DE"), QStringLiteral("fr_CA"),
        QStringLiteral("zh_Hans_CN"), QStringLiteral("pt_BR"), QStringLiteral("ja_JP"),
        QStringLiteral("es_419"), QStringLiteral("sr_Latn_RS")};
    const Platform::Locale english(QStringLiteral("en"));
    const Platform::Locale german(QStringLiteral("de"));

    auto run = [&](bool cached) {
        LocaleDisplayNamePrivate::setHandleCacheEnabled(cached);
        qsizetype sink = 0;
        const double seconds = secondsOf([&] {
            for (int i = 0; i < calls; ++i) {
                const QString &value = values.at(i % values.size());
                sink += displayNameForKey(i % 2 ? english : german, Platform::Locale::LanguageCodeKey, value,
                    LocaleDisplayNameOptions::CapitalizationForListOrMenu)
                            .size();
            }
        });
        if (sink == 0) {
            std::fputs("no names returned\n", stderr);
        }
        return calls / seconds;
    };
    run(true); // warm ICU's data caches before measuring either way
    const double fresh = run(false);
    const double cached = run(true);
    printTable("Locale display names (language key with qualifiers, menu capitalisation)",
        {{"lookups per second, with the caches", cached, "1/s", "fresh ICU handle per lookup", fresh, true}});
    std::printf("speed-up of the caches: %.1fx\n", cached / fresh);
    return 0;
}
