// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QMainWindow>
#include <QMenu>
#include <QObject>
#include <QString>
#include <QStringList>

// Classes that other programs are likely to have, with the names of those of the program in this
// tree but a different layout. Each object checks that its own constructor created it.

/// Out of line, as usual.
class MainWindow : public QMainWindow
{
    Q_OBJECT

public:
    MainWindow();
    bool isWhole() const;

private:
    QMenu* m_menu;
    double m_values[40];
};

/// All inline.
class LogFilter
{
public:
    LogFilter() : m_texts({"a", "b"}) {}
    bool Matches(QString const& line) const { return m_texts.contains(line); }
    bool isWhole() const
    {
        return m_texts.size() == 2 && m_end == 4711 && m_numbers[99] == 0 && Matches("b");
    }

private:
    long m_numbers[100] = {};
    QStringList m_texts;
    int m_end = 4711;
};

/// Partly inline.
class LogView
{
public:
    LogView() = default;
    virtual ~LogView();
    virtual bool isWhole() const { return m_text == "view" && m_padding[299] == 0; }

private:
    char m_padding[300] = {};
    QString m_text = "view";
};

/// With its own meta-object.
class RecentFiles : public QObject
{
    Q_OBJECT

public:
    RecentFiles()
    {
        connect(this, &RecentFiles::Chosen, this, [this] { ++m_chosen; });
    }
    bool isWhole()
    {
        emit Chosen(1, 2);
        return m_chosen == 1 && m_list.isEmpty() && m_padding[49] == 0;
    }

signals:
    void Chosen(int first, int second);

private:
    long m_padding[50] = {};
    QStringList m_list;
    int m_chosen = 0;
};

/// Not a widget, and nearly empty.
struct SettingsEditor
{
    SettingsEditor() : mark('s') {}
    bool isWhole() const { return mark == 's'; }

    char mark;
};

/// Named like helpers of the frame that no installed header declares.
class WithoutOpenGl
{
public:
    WithoutOpenGl() : m_text("own") {}
    bool isWhole() const { return m_text == "own"; }

private:
    QString m_text;
};
bool NestedDeeperThan(char const* xml, int limit);
extern "C" void WakeEventLoop(int value);
