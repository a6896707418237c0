// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "PropertyList.h"

#include <QDateTime>
#include <QFile>
#include <QTimeZone>
#include <QXmlStreamReader>
#include <QXmlStreamWriter>

#include <cmath>

namespace Cadenza::Platform {

namespace {

class Reader
{
public:
    explicit Reader(const QByteArray &bytes)
        : m_xml(bytes)
    { }

    std::optional<QVariant> document(QString *error)
    {
        std::optional<QVariant> root;
        while (!m_xml.atEnd() && !m_failed) {
            const auto token = m_xml.readNext();
            if (token == QXmlStreamReader::StartElement) {
                if (m_xml.name() != u"plist") {
                    fail(QStringLiteral("the root element is <%1>, not <plist>").arg(m_xml.name()));
                    break;
                }
                root = plistBody();
                break;
            }
            if (token == QXmlStreamReader::DTD) {
                // External entities would let a file pull in other files; plists never need them.
                if (!m_xml.entityDeclarations().isEmpty()) {
                    fail(QStringLiteral("entity declarations are not allowed"));
                }
            }
        }
        if (!m_failed && m_xml.hasError()) {
            fail(m_xml.errorString());
        }
        if (!m_failed && !root) {
            fail(QStringLiteral("no <plist> element"));
        }
        if (!m_failed) {
            // Anything but whitespace and comments after the root means a damaged file.
            while (!m_xml.atEnd()) {
                const auto token = m_xml.readNext();
                if (token == QXmlStreamReader::StartElement
                    || (token == QXmlStreamReader::Characters && !m_xml.isWhitespace())) {
                    fail(QStringLiteral("content after the <plist> element"));
                    break;
                }
            }
            if (!m_failed && m_xml.hasError()) {
                fail(m_xml.errorString());
            }
        }
        if (m_failed) {
            if (error) {
                *error = QStringLiteral("line %1: %2").arg(m_xml.lineNumber()).arg(m_error);
            }
            return std::nullopt;
        }
        return root;
    }

private:
    QVariant plistBody()
    {
        QVariant result;
        bool seen = false;
        while (nextChild()) {
            if (seen) {
                fail(QStringLiteral("<plist> holds more than one value"));
                return {};
            }
            result = value(1);
            seen = true;
        }
        if (!seen && !m_failed) {
            fail(QStringLiteral("<plist> holds no value"));
        }
        return result;
    }

    // Moves to the next child element of the current element; false at its end tag.
    bool nextChild()
    {
        while (!m_failed && !m_xml.atEnd()) {
            const auto token = m_xml.readNext();
            switch (token) {
            case QXmlStreamReader::StartElement:
                return true;
            case QXmlStreamReader::EndElement:
                return false;
            case QXmlStreamReader::Characters:
                if (!m_xml.isWhitespace()) {
                    fail(QStringLiteral("unexpected text"));
                    return false;
                }
                break;
            case QXmlStreamReader::Invalid:
                fail(m_xml.errorString());
                return false;
            default:
                break;
            }
        }
        if (!m_failed) {
            fail(QStringLiteral("unexpected end of document"));
        }
        return false;
    }

    QString text()
    {
        const QString s = m_xml.readElementText(QXmlStreamReader::ErrorOnUnexpectedElement);
        if (m_xml.hasError()) {
            fail(m_xml.errorString());
        }
        return s;
    }

    QVariant value(int depth)
    {
        if (depth > PropertyList::MaximumDepth) {
            fail(QStringLiteral("nesting deeper than %1").arg(PropertyList::MaximumDepth));
            return {};
        }
        const auto name = m_xml.name();
        if (name == u"string") {
            return text();
        }
        if (name == u"integer") {
            bool ok = false;
            const QString t = text().trimmed();
            qint64 v = t.toLongLong(&ok);
            if (!ok) {
                // Unsigned 64-bit sizes beyond qint64 are kept as unsigned.
                const quint64 u = t.toULongLong(&ok);
                if (ok) {
                    return QVariant::fromValue(u);
                }
                fail(QStringLiteral("bad integer '%1'").arg(t.left(40)));
                return {};
            }
            return QVariant::fromValue(v);
        }
        if (name == u"real") {
            bool ok = false;
            const QString t = text().trimmed();
            const double v = t.toDouble(&ok);
            if (!ok) {
                fail(QStringLiteral("bad real '%1'").arg(t.left(40)));
                return {};
            }
            return v;
        }
        if (name == u"true" || name == u"false") {
            const bool v = name == u"true";
            if (!text().isEmpty()) {
                fail(QStringLiteral("<true/> and <false/> hold no text"));
            }
            return v;
        }
        if (name == u"date") {
            const QString t = text().trimmed();
            const QDateTime d = QDateTime::fromString(t, Qt::ISODate).toUTC();
            // Fractions of a second are rounded to the millisecond, which can carry the last second
            // of 9999 (or "24:00") into a year no property list can write down.
            if (!d.isValid() || d.date().year() < 1 || d.date().year() > 9999) {
                fail(QStringLiteral("bad date '%1'").arg(t.left(40)));
                return {};
            }
            return d;
        }
        if (name == u"data") {
            QString t = text();
            t.remove(QLatin1Char(' '))
                .remove(QLatin1Char('\n'))
                .remove(QLatin1Char('\t'))
                .remove(QLatin1Char('\r'));
            auto decoded
                = QByteArray::fromBase64Encoding(t.toLatin1(), QByteArray::AbortOnBase64DecodingErrors);
            if (!decoded) {
                fail(QStringLiteral("bad base64 data"));
                return {};
            }
            return *decoded;
        }
        if (name == u"array") {
            QVariantList list;
            while (nextChild()) {
                list.append(value(depth + 1));
                if (m_failed) {
                    return {};
                }
            }
            return list;
        }
        if (name == u"dict") {
            QVariantMap map;
            while (nextChild()) {
                if (m_xml.name() != u"key") {
                    fail(QStringLiteral("<dict> expects <key>, found <%1>").arg(m_xml.name()));
                    return {};
                }
                const QString key = text();
                if (m_failed || !nextChild()) {
                    fail(QStringLiteral("key '%1' has no value").arg(key.left(40)));
                    return {};
                }
                map.insert(key, value(depth + 1));
                if (m_failed) {
                    return {};
                }
            }
            return map;
        }
        fail(QStringLiteral("unknown element <%1>").arg(name));
        return {};
    }

    void fail(const QString &message)
    {
        if (!m_failed) {
            m_failed = true;
            m_error = message;
        }
    }

    QXmlStreamReader m_xml;
    bool m_failed = false;
    QString m_error;
};

// XML 1.0 cannot carry most control characters, U+FFFE, U+FFFF or half a surrogate pair: the writer
// would drop the text, or break the whole document. Those become U+FFFD, once; a carriage return is
// written as a character reference, since a reader turns a literal one into a line feed.
void writeText(QXmlStreamWriter &xml, const QString &element, const QString &text)
{
    xml.writeStartElement(element);
    QString run;
    run.reserve(text.size());
    for (qsizetype i = 0; i < text.size(); ++i) {
        const QChar c = text.at(i);
        if (c == u'\r') {
            xml.writeCharacters(run);
            run.clear();
            xml.writeEntityReference(QStringLiteral("#13"));
        } else if (c.isHighSurrogate() && i + 1 < text.size() && text.at(i + 1).isLowSurrogate()) {
            run.append(c).append(text.at(++i));
        } else if ((c.unicode() < 0x20 && c != u'\t' && c != u'\n') || c.isSurrogate()
            || c.unicode() >= 0xFFFE) {
            run.append(QChar::ReplacementCharacter);
        } else {
            run.append(c);
        }
    }
    xml.writeCharacters(run);
    xml.writeEndElement();
}

QString realText(double v)
{
    // 17 significant digits give the same double back; the sign of zero is kept as well.
    if (v == 0.0 && std::signbit(v)) {
        return QStringLiteral("-0");
    }
    return QString::number(v, 'g', 17);
}

QString dateText(const QDateTime &date)
{
    // Whole seconds as every reader expects them; milliseconds only when there are some.
    const QDateTime utc = date.toUTC();
    if (utc.time().msec() != 0) {
        return utc.toString(Qt::ISODateWithMs);
    }
    return utc.toString(Qt::ISODate);
}

void writeValue(QXmlStreamWriter &xml, const QVariant &value)
{
    switch (value.typeId()) {
    case QMetaType::Bool:
        xml.writeEmptyElement(value.toBool() ? QStringLiteral("true") : QStringLiteral("false"));
        break;
    case QMetaType::Int:
    case QMetaType::LongLong:
    case QMetaType::Long:
    case QMetaType::Short:
    case QMetaType::Char:
    case QMetaType::SChar:
        xml.writeTextElement(QStringLiteral("integer"), QString::number(value.toLongLong()));
        break;
    case QMetaType::UInt:
    case QMetaType::ULongLong:
    case QMetaType::ULong:
    case QMetaType::UShort:
    case QMetaType::UChar:
        xml.writeTextElement(QStringLiteral("integer"), QString::number(value.toULongLong()));
        break;
    case QMetaType::Double:
    case QMetaType::Float:
        xml.writeTextElement(QStringLiteral("real"), realText(value.toDouble()));
        break;
    case QMetaType::QDateTime:
        xml.writeTextElement(QStringLiteral("date"), dateText(value.toDateTime()));
        break;
    case QMetaType::QByteArray:
        xml.writeTextElement(QStringLiteral("data"), QString::fromLatin1(value.toByteArray().toBase64()));
        break;
    case QMetaType::QVariantList:
    case QMetaType::QStringList: {
        xml.writeStartElement(QStringLiteral("array"));
        const auto list = value.toList();
        for (const auto &item : list) {
            writeValue(xml, item);
        }
        xml.writeEndElement();
        break;
    }
    case QMetaType::QVariantMap:
    case QMetaType::QVariantHash: {
        xml.writeStartElement(QStringLiteral("dict"));
        const auto map = value.toMap(); // sorted keys keep files stable under version control
        for (auto it = map.cbegin(); it != map.cend(); ++it) {
            writeText(xml, QStringLiteral("key"), it.key());
            writeValue(xml, it.value());
        }
        xml.writeEndElement();
        break;
    }
    default:
        writeText(xml, QStringLiteral("string"), value.toString());
        break;
    }
}

} // namespace

std::optional<QVariant> PropertyList::parse(const QByteArray &bytes, QString *error)
{
    Reader reader(bytes);
    return reader.document(error);
}

QByteArray PropertyList::serialize(const QVariant &value)
{
    QByteArray out;
    QXmlStreamWriter xml(&out);
    xml.setAutoFormatting(true);
    xml.setAutoFormattingIndent(1);
    xml.writeStartDocument();
    xml.writeDTD(QStringLiteral("<!DOCTYPE plist PUBLIC \"-//Cadenza//DTD PLIST 1.0//EN\" "
                                "\"https://cadenza.invalid/PropertyList-1.0.dtd\">"));
    xml.writeStartElement(QStringLiteral("plist"));
    xml.writeAttribute(QStringLiteral("version"), QStringLiteral("1.0"));
    writeValue(xml, value);
    xml.writeEndElement();
    xml.writeEndDocument();
    return out;
}

std::optional<QVariant> PropertyList::readFile(const QString &path, QString *error)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        if (error) {
            *error = file.errorString();
        }
        return std::nullopt;
    }
    return parse(file.readAll(), error);
}

} // namespace Cadenza::Platform
