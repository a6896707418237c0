// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEPOPUPBUTTON_H
#define CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEPOPUPBUTTON_H

#include "cadenza_export.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "widgets/helpers/PopUpButton.h"
#include <QStringList>

#include <memory>
#include <optional>

class QLabel;
class QProgressBar;

namespace Cadenza {

class CZSRLanguagePopUpButtonPrivate;

/**
 * The dictation language chooser: the visible recognition languages with their countries, then a
 * separator and "Add Language…" or "Customize…", which opens the customise recognition languages
 * sheet. Beside it, an optional text field and busy indicator show recognition-language downloads and
 * keep the installing line up until the dictation engine has loaded the new language (or 30 s pass).
 *
 * Only the first pop-up made in a process follows the notifications that rebuild it; later ones are
 * rebuilt by their clients.
 *
 * @code
 * auto *dictation = new Cadenza::CZSRLanguagePopUpButton(window);
 * dictation->buildPopUpButtonAndSelectLocaleIdentifier(QStringLiteral("de_DE"), networkLocales,
 * offlineLocales); dictation->setEnabled(true); connect(dictation,
 * &Cadenza::CZSRLanguagePopUpButton::languageActivated, window, [dictation] {
 *     useLocale(dictation->selectedLanguageItem()->localeIdentifier());
 * });
 * @endcode
 */
class CADENZA_EXPORT CZSRLanguagePopUpButton : public Platform::PopUpButton
{
    Q_OBJECT
    Q_PROPERTY(bool languagesAreDownloadable READ languagesAreDownloadable WRITE setLanguagesAreDownloadable)
public:
    explicit CZSRLanguagePopUpButton(QWidget *parent = nullptr);
    ~CZSRLanguagePopUpButton() override;

    /**
     * Lists the languages and selects @p localeIdentifier. @p networkSupportedLocaleIdentifiers are the
     * languages the network service recognises (null: the installed recognizers'); the offline list
     * only decides the fallback choice.
     */
    void buildPopUpButtonAndSelectLocaleIdentifier(const QString &localeIdentifier,
        const std::optional<QStringList> &networkSupportedLocaleIdentifiers,
        const std::optional<QStringList> &offlineSupportedLocaleIdentifiers);
    /// The language of the selected item; null for the command item or no selection.
    [[nodiscard]] CZSRLanguageItemPtr selectedLanguageItem() const;
    /// Handles the user's pick: the command item opens the sheet; a language is remembered and
    /// languageActivated() sent. Returns whether it was sent.
    bool sendAction();
    /// The installer finished an item (@p objectIdentifier from the notification).
    void installationFinished(const QString &objectIdentifier);

    [[nodiscard]] QString previouslyChosenLocaleIdentifier() const;
    void setPreviouslyChosenLocaleIdentifier(const QString &locale);
    [[nodiscard]] std::optional<QStringList> networkBasedLocaleIdentifiers() const;
    void setNetworkBasedLocaleIdentifiers(const std::optional<QStringList> &locales);
    [[nodiscard]] std::optional<QStringList> offlineBasedLocaleIdentifiers() const;
    void setOfflineBasedLocaleIdentifiers(const std::optional<QStringList> &locales);
    [[nodiscard]] bool languagesAreDownloadable() const;
    void setLanguagesAreDownloadable(bool downloadable);

    /// Where the download status and its busy indicator are shown; either may be null.
    void setDownloadStatusTextField(QLabel *textField);
    void setDownloadStatusProgressIndicator(QProgressBar *indicator);

Q_SIGNALS:
    /// The user picked a language.
    void languageActivated(int index);

private:
    friend class CZSRLanguagePopUpButtonPrivate;
    std::unique_ptr<CZSRLanguagePopUpButtonPrivate> const d;
};

} // namespace Cadenza

#endif
