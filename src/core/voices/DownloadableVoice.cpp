// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "DownloadableVoice.h"

#include "core/formats/VoiceDescription.h"
#include "core/speech-items/CZSpeechItem.h"
#include "core/speech-items/CZSpeechItem_p.h"

namespace Cadenza {

using SpeechItemPrivate::stringValue;
using SpeechItemPrivate::unsignedValue;

DownloadableVoicePtr DownloadableVoice::initWithVoiceID(const QString &voiceID, const QVariant &entry)
{
    if (entry.typeId() != QMetaType::QVariantMap) {
        return nullptr;
    }
    const QVariantMap properties = entry.toMap();
    auto voice = std::shared_ptr<DownloadableVoice>(new DownloadableVoice);
    // The table's entry for exactly this identifier: no premium fallback for downloads.
    voice->_visibility = visibilityFromTable(visibleVoicesTable(), voiceID, voiceID, false);
    const QVariant attributes = properties.value(QStringLiteral("VoiceAttributes"));
    if (attributes.typeId() == QMetaType::QVariantMap) {
        voice->_voiceAttributes = attributes.toMap();
    }
    voice->_voiceAttributes.insert(Platform::VoiceAttribute::Identifier, voiceID);
    voice->_byteSize = unsignedValue(properties.value(QStringLiteral("VoiceByteSize")));
    voice->_version = stringValue(properties.value(QStringLiteral("VoiceVersion")));
    voice->_tagName = stringValue(properties.value(QStringLiteral("VoiceTag")));
    voice->_fullSizeByteSize = unsignedValue(properties.value(QStringLiteral("FullSizeByteSize")));
    voice->_fullSizeBundleIdentifier
        = stringValue(properties.value(QStringLiteral("FullSizeBundleIdentifier")));
    voice->_fullSizeTagName = stringValue(properties.value(QStringLiteral("FullSizeTagName")));
    voice->_fullSizeVersion = stringValue(properties.value(QStringLiteral("FullSizeVersion")));
    return voice;
}

QString DownloadableVoice::displayedSize() const
{
    return CZSpeechItem::displayStringForByteSize(_byteSize);
}

} // namespace Cadenza
