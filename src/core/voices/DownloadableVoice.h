// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICES_DOWNLOADABLEVOICE_H
#define CADENZA_VOICES_DOWNLOADABLEVOICE_H

#include "CZVoiceObject.h"

namespace Cadenza {

class DownloadableVoice;
using DownloadableVoicePtr = std::shared_ptr<DownloadableVoice>;

/// A voice offered for download, made from its entry of the catalogue's "DownloadableVoices".
class CADENZACORE_EXPORT DownloadableVoice : public CZVoiceObject
{
public:
    /// nullptr when @p properties is not a dictionary; values of the wrong type count as absent.
    [[nodiscard]] static DownloadableVoicePtr initWithVoiceID(
        const QString &voiceID, const QVariant &properties);

    bool isDownloadable() const override { return true; }

    [[nodiscard]] quint64 byteSize() const { return _byteSize; }
    /// Nothing sets it; it reads null.
    [[nodiscard]] QString variant() const { return _variant; }
    [[nodiscard]] QString version() const { return _version; }
    [[nodiscard]] QString tagName() const { return _tagName; }
    [[nodiscard]] QString fullSizeBundleIdentifier() const { return _fullSizeBundleIdentifier; }
    [[nodiscard]] quint64 fullSizeByteSize() const { return _fullSizeByteSize; }
    [[nodiscard]] QString fullSizeTagName() const { return _fullSizeTagName; }
    [[nodiscard]] QString fullSizeVersion() const { return _fullSizeVersion; }
    [[nodiscard]] bool downloadFullSize() const { return _downloadFullSize; }
    void setDownloadFullSize(bool fullSize) { _downloadFullSize = fullSize; }
    /// The download size as text.
    [[nodiscard]] QString displayedSize() const;

private:
    DownloadableVoice() = default;

    quint64 _byteSize = 0;
    QString _variant;
    QString _version;
    QString _tagName;
    QString _fullSizeBundleIdentifier;
    quint64 _fullSizeByteSize = 0;
    QString _fullSizeTagName;
    QString _fullSizeVersion;
    bool _downloadFullSize = false;
};

} // namespace Cadenza

#endif
