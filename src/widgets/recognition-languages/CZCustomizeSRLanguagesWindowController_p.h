// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_RECOGNITIONLANGUAGES_CZCUSTOMIZESRLANGUAGESWINDOWCONTROLLER_P_H
#define CADENZA_RECOGNITIONLANGUAGES_CZCUSTOMIZESRLANGUAGESWINDOWCONTROLLER_P_H

// Not public API: the dictation languages sheet's state and internal operations, for tests.

#include "widgets/helpers/CustomizeSheetController_p.h"
#include "widgets/recognition-languages/CZCustomizeSRLanguagesWindowController.h"

class QComboBox;

namespace Cadenza {

class CZSRLanguageRowCheckboxButton;
class SRLanguageSelectionModel;

class CADENZA_EXPORT CZCustomizeSRLanguagesWindowControllerPrivate : public CustomizeSheetControllerPrivate
{
public:
    explicit CZCustomizeSRLanguagesWindowControllerPrivate(CZCustomizeSRLanguagesWindowController *q);
    ~CZCustomizeSRLanguagesWindowControllerPrivate() override;

    void _rebuildList();
    void _updateDisplayUsingFilterString(const QString &filter);
    void _updateButtonStatesOnlyIfDownloadRequired(bool onlyIfDownloadRequired);
    void _propagateCheckboxSelection(CZSRLanguageRowCheckboxButton *sender);
    void _propagateDownloadVariantSelection(QComboBox *sender, int index);
    void _setRowStatusFieldView(QLabel *statusField, QComboBox *variantPopUpButton,
        const CZSRLanguageItemPtr &speechItem, bool isSelected);
    [[nodiscard]] int displayedRowOfLocale(const QString &localeIdentifier) const;

    // The sheet's rows, for CustomizeSheetControllerPrivate.
    [[nodiscard]] int rowCount() const override { return int(currentlyDisplayedRows.size()); }
    [[nodiscard]] bool isGroupRow(int row) const override
    {
        return currentlyDisplayedRows.at(row)->isGroupRow();
    }
    [[nodiscard]] QWidget *viewForRow(int row, QWidget *spare) override;
    void rebuild() override { _rebuildList(); }
    void updateDisplayUsingFilterString(const QString &filter) override
    {
        _updateDisplayUsingFilterString(filter);
    }
    [[nodiscard]] QVariantList activeInstallations() const override;
    [[nodiscard]] int rowOfInstallationRecord(const QVariantMap &record) override;
    void showInstallationRecord(int row, const QVariantMap &record) override;
    void selectionDidChange() override { _updateButtonStatesOnlyIfDownloadRequired(false); }
    [[nodiscard]] Decision decide() override;
    void didPresent() override { _updateButtonStatesOnlyIfDownloadRequired(true); }

    SRLanguageSelectionModel *languageModel = nullptr;
    QList<CZSRLanguageItemPtr> allObjects;
    QList<CZSRLanguageRowPtr> currentlyDisplayedRows;
    std::optional<QStringList> networkBasedLocaleIdentifiers;
    QString requiredLocaleIdentifier;
    bool supportDownloads = false;

private:
    Q_DECLARE_PUBLIC(CZCustomizeSRLanguagesWindowController)
};

} // namespace Cadenza

#endif
