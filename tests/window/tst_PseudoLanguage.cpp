// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The window in a generated language: each text of the catalogs is longer, has accents and is in
// brackets. A text without brackets cannot be translated.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/language/Language.h"

#include <QAbstractButton>
#include <QDomDocument>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QRegularExpression>
#include <QSet>
#include <QTabBar>
#include <QTranslator>

using namespace Velocor;
using namespace WindowParts;

namespace {

QString lengthened(QString const& text)
{
    // Longer than it is by two fifths, without a change to placeholders and mnemonics.
    QString longer = text;
    longer.replace('a', QString::fromUtf8("\xC3\xA1")).replace('o', QString::fromUtf8("\xC3\xB6"));
    return "[" + longer + QString(text.size() * 2 / 5, '~') + "]";
}

class PseudoLanguage : public QTranslator
{
public:
    PseudoLanguage()
    {
        QDomDocument catalog;
        catalog.setContent(TestFiles::read(PROJECT_FOLDER "/translations/velocor_de.ts"));
        const QDomNodeList messages = catalog.elementsByTagName("message");
        for (int i = 0; i < messages.size(); ++i) {
            const QDomElement message = messages.at(i).toElement();
            const QString source = message.firstChildElement("source").text();
            const bool isKey = source.contains(QRegularExpression("^(Ctrl|Shift|Alt|F\\d)"));
            if (!isKey && !message.hasAttribute("numerus"))
                m_texts.insert(message.parentNode().toElement().firstChildElement("name").text() +
                               '\n' + source);
        }
        QCoreApplication::installTranslator(this);
    }

    ~PseudoLanguage() override { QCoreApplication::removeTranslator(this); }

    bool isEmpty() const override { return m_texts.isEmpty(); }

    QString translate(char const* context, char const* text, char const*, int) const override
    {
        const QString source = QString::fromUtf8(text);
        return m_texts.contains(QString::fromUtf8(context) + '\n' + source) ? lengthened(source)
                                                                            : QString();
    }

private:
    QSet<QString> m_texts;
};

// Whether it is a text for people, and not a name, a number or a plural form, which English has.
bool isText(QString const& text)
{
    static const QRegularExpression word("[A-Za-z]{2}");
    static const QRegularExpression plural("^[0-9., ]+\\S* (line|problem|file|key|item)");
    static const QRegularExpression file("[/\\\\]|^\\w+\\.(cfg|log)$|^(Org|Product)$");
    return text.contains(word) && !text.contains(plural) && !text.contains(file);
}

void check(QString const& text, QString const& where, QStringList& found)
{
    if (isText(text) && !text.contains('['))
        found.append(where + ": " + text);
}

// The texts of a window that have no brackets.
QStringList untranslated(QWidget* window)
{
    QStringList found;
    const QList<QAction*> actions = window->findChildren<QAction*>();
    for (QAction const* action : actions) {
        const QString name = action->data().toString();
        if (action->text().isEmpty() ||
            QString(action->parent()->metaObject()->className())[0] == 'Q')
            continue;
        check(action->text(), "action", found);
        check(action->statusTip(), "status tip of " + action->text(), found);
    }
    const QList<QWidget*> widgets = window->findChildren<QWidget*>();
    for (QWidget const* widget : widgets) {
        const QString name = widget->metaObject()->className();
        if (widget->objectName().startsWith("qt_") ||
            qobject_cast<QTabBar*>(widget->parentWidget()))
            continue; // Qt's own texts
        check(widget->accessibleName(), "name of " + name, found);
        check(widget->accessibleDescription(), "description of " + name, found);
        check(widget->statusTip(), "status tip of " + name, found);
        if (auto const* button = qobject_cast<QAbstractButton const*>(widget))
            check(button->text(), name, found);
        if (auto const* label = qobject_cast<QLabel const*>(widget))
            check(label->text(), name, found);
        if (auto const* line = qobject_cast<QLineEdit const*>(widget))
            check(line->placeholderText(), name, found);
        if (auto const* header = qobject_cast<QHeaderView const*>(widget)) {
            for (int i = 0; header->orientation() == Qt::Horizontal && i < header->count(); ++i)
                check(header->model()->headerData(i, Qt::Horizontal).toString(), name, found);
        }
    }
    found.removeDuplicates();
    return found;
}

// Buttons and labels that are too small for their texts, or not whole in the window.
QStringList cutOff(QWidget* window)
{
    QStringList found;
    const QList<QWidget*> widgets = window->findChildren<QWidget*>();
    for (QWidget const* widget : widgets) {
        auto const* button = qobject_cast<QAbstractButton const*>(widget);
        auto const* label = qobject_cast<QLabel const*>(widget);
        const QString text = button ? button->text() : label ? label->text() : QString();
        if (!text.contains('[') || !widget->isVisible() || widget->window() != window)
            continue;
        const QRect place(widget->mapTo(window, QPoint()), widget->size());
        const bool isSmall = widget->width() < widget->minimumSizeHint().width() ||
                             widget->height() < widget->minimumSizeHint().height();
        if (isSmall || !window->rect().contains(place))
            found.append(text);
    }
    return found;
}

} // namespace

class tst_PseudoLanguage : public WindowTestCase
{
    Q_OBJECT

private slots:
    void log();
    void settings();
    void bars_data();
    void bars();
};

void tst_PseudoLanguage::log()
{
    const PseudoLanguage language;
    QVERIFY(!language.isEmpty());
    const WindowTest test(DemoLog::run(5, QTime(12, 0), "entry"));
    const auto window = WindowTest::show();
    QCOMPARE(untranslated(window.get()).join('\n'), QString());
    QCOMPARE(cutOff(window.get()).join('\n'), QString());
}

void tst_PseudoLanguage::settings()
{
    const PseudoLanguage language;
    const WindowTest test(DemoLog::run(5, QTime(12, 0), "entry"));
    const QString settings = test.folder() + "a.cfg";
    QVERIFY(TestFiles::write(settings, "<VelocorSettings><S><k>1</k></S></VelocorSettings>"));
    const auto window = WindowTest::show({settings});
    QCOMPARE(untranslated(window.get()).join('\n'), QString());
    QCOMPARE(cutOff(window.get()).join('\n'), QString());
}

void tst_PseudoLanguage::bars_data()
{
    QTest::addColumn<QString>("action");
    QTest::newRow("find") << "&Find";
    QTest::newRow("places") << "&Places";
    QTest::newRow("activity") << "&Activity";
    QTest::newRow("time since") << "&Time Since";
    QTest::newRow("all files") << "All Files, &by Time";
    QTest::newRow("further terms") << "Als&o Filter";
}

// What is shown on request.
void tst_PseudoLanguage::bars()
{
    QFETCH(QString, action);
    const PseudoLanguage language;
    const WindowTest test(DemoLog::run(5, QTime(12, 0), "entry"));
    const auto window = WindowTest::show();
    QAction* shown = nullptr;
    const QList<QAction*> actions = window->findChildren<QAction*>();
    for (QAction* one : actions) {
        if (one->text() == lengthened(action))
            shown = one;
    }
    QVERIFY(shown);
    shown->trigger();
    QTest::qWait(0);
    QCOMPARE(untranslated(window.get()).join('\n'), QString());
    QCOMPARE(cutOff(window.get()).join('\n'), QString());
}

QTEST_MAIN(tst_PseudoLanguage)
#include "tst_PseudoLanguage.moc"
