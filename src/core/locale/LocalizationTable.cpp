// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "LocalizationTable.h"

#include "cadenzacore_logging.h"
#include "core/formats/Locale.h"
#include "core/services/Services.h"
#include "core/services/UserLocaleService.h"

#include <QMutex>
#include <QTranslator>

namespace Cadenza::Platform {

namespace {

struct SharedTable
{
    QMutex mutex;
    std::unique_ptr<LocalizationTable> table;
};

SharedTable &sharedTable()
{
    static SharedTable instance;
    return instance;
}

} // namespace

LocalizationTable::LocalizationTable(const QString &language)
    : m_language(shippedLanguages().contains(language) ? language : QStringLiteral("en"))
    , m_translator(std::make_unique<QTranslator>())
{
    const QString file = QStringLiteral(":/cadenza/translations/cadenza_%1.qm").arg(m_language);
    if (!m_translator->load(file)) {
        qCWarning(lcLocalization, "Cannot load the localisation table %s", qPrintable(file));
    }
}

LocalizationTable::~LocalizationTable() = default;

const LocalizationTable &LocalizationTable::shared()
{
    SharedTable &s = sharedTable();
    QMutexLocker locker(&s.mutex);
    if (!s.table) {
        s.table = std::make_unique<LocalizationTable>(hostPreferredLocalization());
    }
    return *s.table;
}

void LocalizationTable::resetShared()
{
    SharedTable &s = sharedTable();
    QMutexLocker locker(&s.mutex);
    s.table.reset();
}

QStringList LocalizationTable::shippedLanguages()
{
    return {QStringLiteral("en"), QStringLiteral("de")};
}

QString LocalizationTable::hostPreferredLocalization()
{
    const QStringList shipped = shippedLanguages();
    const QStringList preferred = Services::userLocale().preferredLanguages();
    for (const QString &language : preferred) {
        const QString code = Locale::componentsFromLocaleIdentifier(language).languageCode;
        if (shipped.contains(code)) {
            return code;
        }
    }
    return QStringLiteral("en");
}

QString LocalizationTable::text(const QString &key) const
{
    const QByteArray id = key.toUtf8();
    return m_translator->translate(nullptr, id.constData());
}

QString LocalizationTable::format(const QString &key, const QStringList &arguments) const
{
    return fill(text(key), arguments);
}

QString LocalizationTable::fill(const QString &templateText, const QStringList &arguments)
{
    QString out;
    out.reserve(templateText.size() + 32);
    qsizetype nextSequential = 0;
    const qsizetype n = templateText.size();
    for (qsizetype i = 0; i < n; ++i) {
        const QChar c = templateText.at(i);
        if (c != u'%' || i + 1 >= n) {
            out.append(c);
            continue;
        }
        const QChar next = templateText.at(i + 1);
        if (next == u'%') {
            out.append(u'%');
            ++i;
        } else if (next == u'@') {
            out.append(arguments.value(nextSequential++));
            ++i;
        } else if (next >= u'1' && next <= u'9') {
            const qsizetype index = next.unicode() - u'1';
            out.append(arguments.value(index));
            i += 1;
            if (i + 2 < n && templateText.at(i + 1) == u'$' && templateText.at(i + 2) == u'@') {
                i += 2;
            }
        } else {
            out.append(c);
        }
    }
    return out;
}

} // namespace Cadenza::Platform
