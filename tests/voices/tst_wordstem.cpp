#include "voices/WordStem.h"

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
};

QTEST_GUILESS_MAIN(WordStemTest)
#include "tst_wordstem.moc"
