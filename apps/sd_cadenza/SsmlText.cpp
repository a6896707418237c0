// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "SsmlText.h"

#include <QRegularExpression>
#include <QStringDecoder>
#include <QXmlStreamReader>

namespace SdCadenza {

namespace {

/// Longest pause honoured: a typo in a break must not silence the reader for hours.
constexpr int MaximumPauseMs = 10000;

void appendText(QList<SsmlText::Segment> &segments, const QString &text)
{
    if (text.isEmpty()) {
        return;
    }
    if (!segments.isEmpty() && segments.last().kind == SsmlText::Segment::Kind::Text) {
        segments.last().text += text;
        return;
    }
    segments.append({SsmlText::Segment::Kind::Text, text, 0});
}

QString withoutControls(const QString &text)
{
    QString out;
    out.reserve(text.size());
    for (const QChar c : text) {
        const char16_t u = c.unicode();
        if (u == u'\n' || u == u'\t') {
            out += u' ';
        } else if (u < 0x20 || u == 0x7f || (u >= 0x80 && u < 0xa0) || u == 0xfffd) {
            continue;
        } else {
            out += c;
        }
    }
    return out;
}

} // namespace

QString SsmlText::decode(const QByteArray &bytes)
{
    // Qt turns each invalid sequence into U+FFFD, which withoutControls() then drops.
    QStringDecoder decoder(QStringDecoder::Utf8);
    const QString text = decoder.decode(bytes);
    QString out;
    out.reserve(text.size());
    for (const QChar c : text) {
        const char16_t u = c.unicode();
        if (u == 0xfffd || (u < 0x20 && u != u'\n' && u != u'\t') || u == 0x7f) {
            continue;
        }
        out += c;
    }
    return out;
}

QString SsmlText::spelled(const QString &text)
{
    QString out;
    out.reserve(text.size() * 2);
    for (qsizetype i = 0; i < text.size(); ++i) {
        if (text.at(i).isSpace()) {
            continue;
        }
        if (!out.isEmpty()) {
            out += QLatin1Char(' ');
        }
        out += text.at(i);
        if (text.at(i).isHighSurrogate() && i + 1 < text.size()) {
            out += text.at(++i);
        }
    }
    return out;
}

int SsmlText::breakMilliseconds(const QString &time, const QString &strength)
{
    if (!time.isEmpty()) {
        static const QRegularExpression pattern(QStringLiteral("^\\s*([0-9]+(?:\\.[0-9]+)?)\\s*(ms|s)\\s*$"));
        const auto match = pattern.match(time);
        if (!match.hasMatch()) {
            return -1;
        }
        double ms = match.captured(1).toDouble();
        if (match.captured(2) == u"s") {
            ms *= 1000;
        }
        return int(qBound(0.0, ms, double(MaximumPauseMs)));
    }
    if (strength == u"none") {
        return 0;
    }
    if (strength == u"x-weak") {
        return 100;
    }
    if (strength == u"weak") {
        return 200;
    }
    if (strength == u"strong") {
        return 700;
    }
    if (strength == u"x-strong") {
        return 1000;
    }
    return 400; // "medium" and a break that says nothing
}

QList<SsmlText::Segment> SsmlText::parse(const QString &message)
{
    if (!message.trimmed().startsWith(QLatin1Char('<'))) {
        return parsePlain(message);
    }
    QList<Segment> segments;
    QXmlStreamReader reader(message);
    int spelling = 0;
    QList<bool> sayAsSpells; // one entry per open <say-as>
    while (!reader.atEnd()) {
        switch (reader.readNext()) {
        case QXmlStreamReader::StartElement: {
            const auto name = reader.name();
            const auto attributes = reader.attributes();
            if (name == u"break") {
                const int ms = breakMilliseconds(attributes.value(QLatin1StringView("time")).toString(),
                    attributes.value(QLatin1StringView("strength")).toString());
                if (ms > 0) {
                    segments.append({Segment::Kind::Pause, {}, ms});
                }
            } else if (name == u"mark") {
                const QString mark = withoutControls(attributes.value(QLatin1StringView("name")).toString());
                if (!mark.isEmpty()) {
                    segments.append({Segment::Kind::Mark, mark, 0});
                }
            } else if (name == u"say-as") {
                const auto how = attributes.value(QLatin1StringView("interpret-as"));
                const bool spells = how == u"characters" || how == u"tts:char" || how == u"spell";
                sayAsSpells.append(spells);
                spelling += spells ? 1 : 0;
            }
            break;
        }
        case QXmlStreamReader::EndElement:
            if (reader.name() == u"say-as" && !sayAsSpells.isEmpty()) {
                spelling -= sayAsSpells.takeLast() ? 1 : 0;
            } else if (reader.name() == u"p" || reader.name() == u"s") {
                appendText(segments, QStringLiteral(" "));
            }
            break;
        case QXmlStreamReader::Characters: {
            const QString text = withoutControls(reader.text().toString());
            appendText(segments, spelling > 0 ? QLatin1Char(' ') + spelled(text) + QLatin1Char(' ') : text);
            break;
        }
        default:
            break;
        }
    }
    if (reader.hasError()) {
        // Not SSML after all (or cut short): say the words, leave the tags out.
        return parsePlain(message);
    }
    return segments;
}

QList<SsmlText::Segment> SsmlText::parsePlain(const QString &message)
{
    // A tag cut off at the end of the message goes too.
    static const QRegularExpression tag(QStringLiteral("<[^<>]*(>|$)"));
    QString text = message;
    text.remove(tag);
    text.replace(QStringLiteral("&lt;"), QStringLiteral("<"));
    text.replace(QStringLiteral("&gt;"), QStringLiteral(">"));
    text.replace(QStringLiteral("&quot;"), QStringLiteral("\""));
    text.replace(QStringLiteral("&apos;"), QStringLiteral("'"));
    text.replace(QStringLiteral("&amp;"), QStringLiteral("&"));
    QList<Segment> segments;
    appendText(segments, withoutControls(text));
    return segments;
}

} // namespace SdCadenza
