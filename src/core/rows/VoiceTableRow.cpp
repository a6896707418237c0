// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "VoiceTableRow.h"

#include "core/formats/VoiceDescription.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "protocol/InstallerProtocol.h"

#include <QHash>

#include <algorithm>

namespace Cadenza {

namespace {

QString withoutQualitySuffix(const QString &title)
{
    if (title.endsWith(QLatin1String("Compact")) || title.endsWith(QLatin1String("Premium"))) {
        return title.chopped(qMin<qsizetype>(8, title.size())); // guarded: "Premium" alone becomes ""
    }
    return title;
}

QStringList sortedForDisplay(QStringList keys)
{
    std::sort(keys.begin(), keys.end(),
        [](const QString &a, const QString &b) { return SpeechItemPrivate::compareForDisplay(a, b) < 0; });
    return keys;
}

void sortVoices(QList<CZVoiceObjectPtr> &voices)
{
    std::stable_sort(voices.begin(), voices.end(),
        [](const CZVoiceObjectPtr &a, const CZVoiceObjectPtr &b) { return a->compare(*b) < 0; });
}

// Keys in the order they were first met, beside the values.
template<typename Value>
struct OrderedGroups
{
    QStringList keys;
    QHash<QString, Value> values;
    Value &operator[](const QString &key)
    {
        if (!values.contains(key)) {
            keys.append(key);
        }
        return values[key];
    }
};

} // namespace

VoiceTableRowPtr VoiceTableRow::initWithTitle(const QString &title, const CZVoiceObjectPtr &voiceObject)
{
    auto row = std::shared_ptr<VoiceTableRow>(new VoiceTableRow);
    row->m_title = withoutQualitySuffix(title);
    row->m_voiceObject = voiceObject;
    return row;
}

void VoiceTableRow::setSelected(bool selected)
{
    m_selected = selected;
    if (m_voiceObject) {
        m_voiceObject->setVisibility(selected ? 1 : 0);
    }
}

void VoiceTableRow::setSelectedUsingLanguageCodeOnlyToSelectVoices(bool languageCodeOnly)
{
    if (m_groupRow || !m_voiceObject) {
        return;
    }
    CZVoiceObject &voice = *m_voiceObject;
    const qint64 status = voice.downloadStatus();
    if (status == InstallerProtocol::DownloadingStatus || status == InstallerProtocol::WaitingStatus) {
        m_selected = true;
        voice.setVisibility(1); // a voice being fetched is always shown
        return;
    }
    if (voice.visibility() != 2) {
        m_selected = voice.visibility() == 1;
        return;
    }
    const bool suits
        = languageCodeOnly ? voice.isAppropriateForSystemLangauge() : voice.doesMatchSystemLocale();
    if (!suits) {
        return;
    }
    // Ticked when its base voice is installed: for "X.premium" that is "X" or "X.compact".
    m_selected = !voice.showsInFullListOnly()
        && Platform::VoiceDescription::isBaseVoicePresent(voice.identifier(), [](const QString &form) {
               return !Platform::Services::speechSynthesis().attributesForVoice(form).isEmpty();
           });
}

QString VoiceTableRow::description() const
{
    return m_groupRow || !m_voiceObject ? m_title : m_voiceObject->description();
}

QList<VoiceTableRowPtr> VoiceTableRow::arrangedRowsFromVoiceObjects(
    const QList<CZVoiceObjectPtr> &voiceObjects, bool useLanguageCodeOnlyToSelectVoices,
    bool showIndividualQualities, bool showFullGroupNames, bool showCurrentLocaleAtTop)
{
    Q_UNUSED(showIndividualQualities); // the arrangement is the same either way, on purpose

    using Genders = OrderedGroups<QList<CZVoiceObjectPtr>>;
    using Countries = OrderedGroups<Genders>;
    OrderedGroups<Countries> languages;
    bool anyMatchesSystemLocale = false;
    for (const auto &voice : voiceObjects) {
        languages[voice->languageDisplayString()][voice->countryDisplayString()][voice->genderDisplayString()]
            .append(voice);
        if (!anyMatchesSystemLocale) {
            anyMatchesSystemLocale = voice->doesMatchSystemLocale();
        }
    }

    const Platform::LocalizationTable &table = Platform::LocalizationTable::shared();
    QList<VoiceTableRowPtr> result;
    std::optional<QList<VoiceTableRowPtr>> topRows;
    if (showCurrentLocaleAtTop) {
        topRows.emplace();
    }
    auto voiceRow = [&](const CZVoiceObjectPtr &voice) {
        VoiceTableRowPtr row = initWithTitle(voice->displayName(), voice);
        row->setSelectedUsingLanguageCodeOnlyToSelectVoices(useLanguageCodeOnlyToSelectVoices);
        return row;
    };
    auto headingRow = [](const QString &title) {
        VoiceTableRowPtr row = initWithTitle(title, nullptr);
        row->setGroupRow(true);
        return row;
    };

    for (const QString &language : sortedForDisplay(languages.keys)) {
        Countries &countries = languages.values[language];
        for (const QString &country : sortedForDisplay(countries.keys)) {
            Genders &genders = countries.values[country];
            const QString languageLabel
                = (languages.keys.size() < 2 && !showFullGroupNames) ? QString() : language;
            QString groupTitle;
            if (countries.keys.size() > 1 || showFullGroupNames) {
                groupTitle = languageLabel.isEmpty()
                    ? country
                    : table.format(
                        QStringLiteral("LanguageWithCountryGroupFormat"), {languageLabel, country});
            } else {
                groupTitle = languageLabel;
            }
            const QStringList genderKeys = sortedForDisplay(genders.keys);
            bool anyLarge = false;
            for (const QString &gender : genderKeys) {
                anyLarge = anyLarge || genders.values[gender].size() > 2;
            }
            const bool splitByGender = genderKeys.size() >= 2 && anyLarge;

            const CZVoiceObjectPtr sample = genders.values[genderKeys.first()].first();
            const bool groupMatches = sample->doesMatchSystemLocale();
            const bool groupAppropriate = groupMatches ? false : sample->isAppropriateForSystemLangauge();

            QList<VoiceTableRowPtr> rows;
            if (splitByGender) {
                for (const QString &gender : genderKeys) {
                    rows.append(headingRow(groupTitle.isEmpty()
                            ? gender
                            : table.format(
                                QStringLiteral("LanguageWithGenderGroupFormat"), {groupTitle, gender})));
                    QList<CZVoiceObjectPtr> voices = genders.values[gender];
                    sortVoices(voices);
                    for (const auto &voice : voices) {
                        rows.append(voiceRow(voice));
                    }
                }
            } else {
                QList<CZVoiceObjectPtr> voices;
                for (const QString &gender : genderKeys) {
                    voices.append(genders.values[gender]);
                }
                if (!groupTitle.isEmpty()) {
                    rows.append(headingRow(groupTitle));
                }
                sortVoices(voices);
                for (const auto &voice : voices) {
                    rows.append(voiceRow(voice));
                }
            }
            const bool onTop = topRows
                && ((anyMatchesSystemLocale && groupMatches)
                    || (!anyMatchesSystemLocale && groupAppropriate));
            (onTop ? *topRows : result).append(rows);
        }
    }
    if (topRows && !topRows->isEmpty()) {
        result = *topRows + result;
    }
    return result;
}

} // namespace Cadenza
