// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_CUSTOMIZEVOICES_VOICETABLEROW_H
#define CADENZA_CUSTOMIZEVOICES_VOICETABLEROW_H

#include "cadenzacore_export.h"

#include "core/voices/CZVoiceObject.h"

#include <QList>
#include <QString>

#include <memory>

namespace Cadenza {

class VoiceTableRow;
using VoiceTableRowPtr = std::shared_ptr<VoiceTableRow>;

/**
 * One row of a voice list: a heading (language, country, gender) or a voice with its tick. Both the
 * customise sheet and the voice menus are built from these rows.
 */
class CADENZACORE_EXPORT VoiceTableRow
{
public:
    /// A row titled @p title without a trailing " Compact" or " Premium".
    [[nodiscard]] static VoiceTableRowPtr initWithTitle(
        const QString &title, const CZVoiceObjectPtr &voiceObject);

    /**
     * Headings and voice rows for @p voiceObjects, grouped by language, country and gender display
     * names, sorted as names shown to users, with the initial ticks set. With
     * @p showCurrentLocaleAtTop, the groups of the user's locale (or language) come first.
     * @p showIndividualQualities is accepted and ignored.
     */
    [[nodiscard]] static QList<VoiceTableRowPtr> arrangedRowsFromVoiceObjects(
        const QList<CZVoiceObjectPtr> &voiceObjects, bool useLanguageCodeOnlyToSelectVoices,
        bool showIndividualQualities, bool showFullGroupNames, bool showCurrentLocaleAtTop);

    [[nodiscard]] QString title() const { return m_title; }
    [[nodiscard]] CZVoiceObjectPtr voiceObject() const { return m_voiceObject; }
    [[nodiscard]] qsizetype tableIndex() const { return m_tableIndex; }
    void setTableIndex(qsizetype index) { m_tableIndex = index; }
    [[nodiscard]] bool isSelected() const { return m_selected; }
    /// Also writes the voice's visibility: 1 when ticked, 0 when not.
    void setSelected(bool selected);
    [[nodiscard]] bool isGroupRow() const { return m_groupRow; }
    void setGroupRow(bool groupRow) { m_groupRow = groupRow; }
    /// The initial tick: downloads are shown; a recorded choice is kept; otherwise a voice that suits
    /// the user's locale (or, with @p languageCodeOnly, language) and whose base voice is installed.
    void setSelectedUsingLanguageCodeOnlyToSelectVoices(bool languageCodeOnly);
    [[nodiscard]] QString description() const;

private:
    VoiceTableRow() = default;

    QString m_title;
    qsizetype m_tableIndex = 0;
    bool m_selected = false;
    bool m_groupRow = false;
    CZVoiceObjectPtr m_voiceObject;
};

} // namespace Cadenza

#endif
