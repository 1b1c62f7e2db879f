// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkErrorDictionary.h"

#include "xml/VirtualSlot.h"

#include <QtTest>

#include <limits>
#include <memory>
#include <type_traits>
#include <utility>

static_assert(std::is_base_of<QObject, TorkErrorDictionary>::value, "a dictionary is a QObject");
static_assert(
    std::is_same<decltype(std::declval<TorkErrorDictionary&>().name()), QString const&>::value,
    "the name is handed out read-only, without a copy");

namespace {

// A dictionary as a component would derive it: three codes starting at its base.
class ReaderErrors : public TorkErrorDictionary
{
public:
    explicit ReaderErrors(bool* destroyed = nullptr)
        : TorkErrorDictionary("Reader", 2000), m_destroyed(destroyed)
    {
        setMaxErrorCode(2002);
    }

    ~ReaderErrors() override
    {
        if (m_destroyed)
            *m_destroyed = true;
    }

    bool decode(int code, QString& text) override
    {
        static char const* const texts[] = {"no title", "no address", "too deep"};
        const int first = static_cast<int>(baseErrorCode());
        if (code < first || code > static_cast<int>(maxErrorCode()))
            return TorkErrorDictionary::decode(code, text);

        text = QString::fromLatin1(texts[code - first]);
        return true;
    }

private:
    bool* m_destroyed;
};

} // namespace

class tst_TorkErrorDictionary : public QObject
{
    Q_OBJECT

private slots:
    void construction_data();
    void construction();
    void maxErrorCode_data();
    void maxErrorCode();
    void baseDecodesNothing_data();
    void baseDecodesNothing();
    void derivedDecode_data();
    void derivedDecode();
    void isAPlainObjectWithoutParent();
    void isDestroyedThroughItsBase();
    void decodeComesAfterTheObjectsOperations();
};

void tst_TorkErrorDictionary::construction_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<unsigned int>("base");

    QTest::newRow("plain") << "XML" << 1000u;
    QTest::newRow("no name") << QString() << 1000u;
    QTest::newRow("base code 0") << "XML" << 0u;
    QTest::newRow("base code beyond the signed range") << "XML" << 0x80000000u;
    QTest::newRow("largest base code") << "XML" << std::numeric_limits<unsigned int>::max();
}

void tst_TorkErrorDictionary::construction()
{
    QFETCH(QString, name);
    QFETCH(unsigned int, base);

    TorkErrorDictionary dictionary(name, base);

    QCOMPARE(dictionary.name(), name);
    QCOMPARE(dictionary.baseErrorCode(), base);
    QCOMPARE(dictionary.maxErrorCode(), 0u);
}

void tst_TorkErrorDictionary::maxErrorCode_data()
{
    QTest::addColumn<unsigned int>("maximum");

    QTest::newRow("above the base") << 1016u;
    QTest::newRow("below the base is not checked") << 1u;
    QTest::newRow("back to 0") << 0u;
    QTest::newRow("largest") << std::numeric_limits<unsigned int>::max();
}

void tst_TorkErrorDictionary::maxErrorCode()
{
    QFETCH(unsigned int, maximum);
    TorkErrorDictionary dictionary("XML", 1000);
    dictionary.setMaxErrorCode(5);

    dictionary.setMaxErrorCode(maximum);

    QCOMPARE(dictionary.maxErrorCode(), maximum);
    QCOMPARE(dictionary.baseErrorCode(), 1000u);
    QCOMPARE(dictionary.name(), QString("XML"));
}

void tst_TorkErrorDictionary::baseDecodesNothing_data()
{
    QTest::addColumn<int>("code");
    QTest::addColumn<QString>("text");

    QTest::newRow("text is emptied") << 1000 << "left over";
    QTest::newRow("empty text stays empty") << 1000 << "";
    QTest::newRow("inside the range") << 1008 << "left over";
    QTest::newRow("last code") << 1016 << "left over";
    QTest::newRow("below the range") << 999 << "left over";
    QTest::newRow("above the range") << 1017 << "left over";
    QTest::newRow("success") << 0 << "left over";
    QTest::newRow("negative") << -1 << "left over";
}

void tst_TorkErrorDictionary::baseDecodesNothing()
{
    QFETCH(int, code);
    QFETCH(QString, text);
    TorkErrorDictionary dictionary("XML", 1000);
    dictionary.setMaxErrorCode(1016);

    QVERIFY(!dictionary.decode(code, text));
    QCOMPARE(text, QString());
}

void tst_TorkErrorDictionary::derivedDecode_data()
{
    QTest::addColumn<int>("code");
    QTest::addColumn<bool>("known");
    QTest::addColumn<QString>("expected");

    QTest::newRow("first code") << 2000 << true << "no title";
    QTest::newRow("last code") << 2002 << true << "too deep";
    QTest::newRow("below the base") << 1999 << false << "";
    QTest::newRow("above the maximum") << 2003 << false << "";
}

void tst_TorkErrorDictionary::derivedDecode()
{
    QFETCH(int, code);
    QFETCH(bool, known);
    QFETCH(QString, expected);
    const std::unique_ptr<TorkErrorDictionary> dictionary(new ReaderErrors);

    QString text("left over");
    QCOMPARE(dictionary->decode(code, text), known);
    QCOMPARE(text, expected);
}

void tst_TorkErrorDictionary::isAPlainObjectWithoutParent()
{
    TorkErrorDictionary dictionary("XML", 1000);

    QVERIFY(dictionary.parent() == nullptr);
    QCOMPARE(dictionary.metaObject()->className(), "QObject");
    QCOMPARE(dictionary.objectName(), QString());
}

void tst_TorkErrorDictionary::isDestroyedThroughItsBase()
{
    bool destroyed = false;
    QObject* object = new ReaderErrors(&destroyed);

    delete object;

    QVERIFY(destroyed);
}

void tst_TorkErrorDictionary::decodeComesAfterTheObjectsOperations()
{
    // Twelve slots of QObject: three of the meta-object, the destructor's two and seven more.
    QCOMPARE(int(VirtualSlot(&TorkErrorDictionary::decode)), 12);
}

QTEST_GUILESS_MAIN(tst_TorkErrorDictionary)
#include "tst_TorkErrorDictionary.moc"
