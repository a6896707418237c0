// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "core/locale/WordStem.h"

#include <QRandomGenerator>
#include <QTest>

using namespace Cadenza;

class WordStemTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void wordStems_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<QString>("stem");
        QTest::addColumn<bool>("expected");
        QTest::newRow("after a blank, any case") << "British English"
                                                 << "english" << true;
        QTest::newRow("inside a word") << "British English"
                                       << "lish" << false;
        QTest::newRow("at the start") << "British English"
                                      << "brit" << true;
        QTest::newRow("only the first occurrence counts") << "Atom Tom"
                                                          << "tom" << false;
        QTest::newRow("after a tab is not after a blank") << "a\tbc"
                                                          << "bc" << false;
        QTest::newRow("absent") << "Maren"
                                << "x" << false;
        QTest::newRow("empty stem") << "Maren"
                                    << "" << false;
        QTest::newRow("empty text") << ""
                                    << "a" << false;
        QTest::newRow("whole text") << "Orin"
                                    << "ORIN" << true;
        QTest::newRow("non-ASCII case") << "Amélie Premium"
                                        << "AMÉ" << true;
    }
    void wordStems()
    {
        QFETCH(QString, text);
        QFETCH(QString, stem);
        QFETCH(bool, expected);
        QCOMPARE(containsWordStem(text, stem), expected);
    }

    void anyWord_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<QString>("words");
        QTest::addColumn<bool>("expected");
        QTest::newRow("second word matches") << "Maren Premium"
                                             << "zz prem" << true;
        QTest::newRow("none matches") << "Maren Premium"
                                      << "zz yy" << false;
        QTest::newRow("empty") << "Maren Premium"
                               << "" << false;
        QTest::newRow("blanks only") << "Maren Premium"
                                     << "   " << false;
        QTest::newRow("double blank between") << "Maren Premium"
                                              << "zz  mar" << true;
    }
    void anyWord()
    {
        QFETCH(QString, text);
        QFETCH(QString, words);
        QFETCH(bool, expected);
        QCOMPARE(containsWords(text, words), expected);
    }

    void searchAgreesWithQtIgnoringCase()
    {
        // The fast search must find exactly what QString::indexOf finds, for any mix of cases,
        // accents, final sigma, dotted and dotless i, and letters outside the first plane.
        const QString alphabet = QStringLiteral(
            "aAbBeE \u00e9\u00c9\u00df\u03c3\u03c2\u03a3\u0130\u0131iI\u00e5\u00c5\U00010400\U00010428");
        QList<QString> letters;
        for (qsizetype i = 0; i < alphabet.size(); ++i) {
            if (alphabet.at(i).isHighSurrogate()) {
                letters.append(alphabet.mid(i, 2));
                ++i;
            } else {
                letters.append(alphabet.mid(i, 1));
            }
        }
        QRandomGenerator random(20261122);
        const auto randomText = [&](int maximum) {
            QString text;
            const int length = int(random.bounded(maximum + 1));
            for (int i = 0; i < length; ++i) {
                text += letters.at(random.bounded(int(letters.size())));
            }
            return text;
        };
        for (int round = 0; round < 20000; ++round) {
            const QString text = randomText(12);
            const QString stem = randomText(3);
            QCOMPARE(firstIndexIgnoringCase(text, stem), text.indexOf(stem, 0, Qt::CaseInsensitive));
        }
    }
};

QTEST_GUILESS_MAIN(WordStemTest)
#include "tst_wordstem.moc"
