#ifndef CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEPOPUPBUTTON_H
#define CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEPOPUPBUTTON_H

#include "cadenza_export.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/recognition-items/CZSRLanguageRow.h"

#include "widgets/helpers/PopUpButton.h"
#include <QPointer>
#include <QStringList>

#include <memory>
#include <optional>

class QLabel;
class QProgressBar;
class QTimer;

namespace Cadenza {

class DownloadStatusLine;
class VoiceMenuModel;

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

    [[nodiscard]] QString previouslyChosenLocaleIdentifier() const
    {
        return m_previouslyChosenLocaleIdentifier;
    }
    void setPreviouslyChosenLocaleIdentifier(const QString &locale)
    {
        m_previouslyChosenLocaleIdentifier = locale;
    }
    [[nodiscard]] std::optional<QStringList> networkBasedLocaleIdentifiers() const { return m_network; }
    void setNetworkBasedLocaleIdentifiers(const std::optional<QStringList> &locales) { m_network = locales; }
    [[nodiscard]] std::optional<QStringList> offlineBasedLocaleIdentifiers() const { return m_offline; }
    void setOfflineBasedLocaleIdentifiers(const std::optional<QStringList> &locales) { m_offline = locales; }
    [[nodiscard]] bool languagesAreDownloadable() const { return m_languagesAreDownloadable; }
    void setLanguagesAreDownloadable(bool downloadable) { m_languagesAreDownloadable = downloadable; }

    /// Where the download status and its busy indicator are shown; either may be null.
    void setDownloadStatusTextField(QLabel *textField);
    void setDownloadStatusProgressIndicator(QProgressBar *indicator);

    void _startDelayedPopUpUpdate();
    void _updateSRLanguageMenu();
    void _updateDownloadStatusFields();
    /// The status text, or null; starts or stops the 0.5-second refresh.
    [[nodiscard]] QString _statusStringForActiveDownloads();
    void _clearDownloadStatusFieldAfterPreHeat();
    [[nodiscard]] int _numberOfFixedItemsAtEndOfMenu() const { return m_numberOfFixedItemsAtEndOfMenu; }
    [[nodiscard]] bool _isWaitingForPreHeat() const { return m_preHeatTimer != nullptr; }
    [[nodiscard]] bool _hasDownloadStatusUpdateTimer() const;
    [[nodiscard]] QList<CZSRLanguageRowPtr> rows() const { return m_rows; }

Q_SIGNALS:
    /// The user picked a language.
    void languageActivated(int index);

private:
    QString m_previouslyChosenLocaleIdentifier;
    std::optional<QStringList> m_network;
    std::optional<QStringList> m_offline;
    int m_numberOfFixedItemsAtEndOfMenu = 1;
    DownloadStatusLine *m_statusLine;
    QTimer *m_preHeatTimer = nullptr;
    bool m_languagesAreDownloadable = false;
    VoiceMenuModel *m_menu;
    QList<CZSRLanguageRowPtr> m_rows;
};

} // namespace Cadenza

#endif
