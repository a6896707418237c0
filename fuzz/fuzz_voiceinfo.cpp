// Info.plist of an installed voice bundle, as the voice list reads it: any bytes may sit in a bundle
// somebody copied into a voice folder.
#include "platform/PropertyList.h"
#include "platform/VoiceDescription.h"

using namespace Cadenza::Platform;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const auto value = PropertyList::parse(QByteArray(reinterpret_cast<const char *>(data), qsizetype(size)));
    if (!value) {
        return 0;
    }
    QString error;
    const auto voice = VoiceDescription::fromInfo(value->toMap(), &error);
    if (!voice) {
        // A refused bundle is logged by its reason, so there must be one.
        if (error.isEmpty()) {
            __builtin_trap();
        }
        return 0;
    }
    // What the voice list and the speech engine rely on for every accepted voice.
    if (voice->identifier.isEmpty() || voice->groups.isEmpty() || voice->engineName.isEmpty()
        || (voice->engineName == u"espeak-ng" && voice->engineVoice.isEmpty()) || voice->enginePitch < 0
        || voice->enginePitch > 100 || voice->engineRate < 80 || voice->engineRate > 450
        || voice->attributes.value(VoiceAttribute::Identifier).toString() != voice->identifier) {
        __builtin_trap();
    }
    (void)VoiceDescription::qualityOf(voice->identifier);
    (void)VoiceDescription::baseIdentifierOf(voice->identifier);
    return 0;
}
