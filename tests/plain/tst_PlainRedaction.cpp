// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Plants secrets of all kinds in logs and settings files, and looks for what is left of them, and
// for what else has changed. Where the secrets are comes from the generator, not from what the
// redactor looks for.

#include "app/report/Redactor.h"

#include "Rounds.h"

#include <QRegularExpression>
#include <QUrl>
#include <QtTest>

#include <algorithm>
#include <cstdio>
#include <random>
#include <vector>

using namespace Velocor;

namespace {

// A line or a few, of what may be read and what may not.
struct Record
{
    QString text;        // as in the file
    QString rest;        // the same without the secrets
    QStringList secrets; // none of these may be left
};

class Generator
{
public:
    explicit Generator(quint32 seed) : m_random(seed)
    {
        m_user = name(5, 9);
        m_other = name(5, 9);
        m_host = name(4, 8) + number(100);
        m_home = pick({"/home/", "/Users/", "/srv/people/"}) + m_user +
                 pick({"", " " + name(4, 6), QString::fromUtf8("ö")});
        m_word = name(6, 9) + " " + name(6, 9);
    }

    void Teach(Redactor& redactor) const
    {
        redactor.AddSecret(SecretKind::UserName, m_user);
        redactor.AddSecret(SecretKind::HostName, m_host);
        redactor.AddSecret(SecretKind::HomeFolder, m_home);
        redactor.SetWords({m_word});
    }

    Record Next()
    {
        m_record = Record();
        const int kind = below(Kinds + Kinds / 2);
        if (kind < Kinds)
            planted(kind);
        else
            plain();
        return m_record;
    }

    int count(int kind) const { return m_counts[kind]; }
    int Total() const { return std::accumulate(m_counts, m_counts + Kinds, 0); }

    static constexpr int Kinds = 14;

private:
    int below(int limit) { return std::uniform_int_distribution<int>(0, limit - 1)(m_random); }
    int between(int low, int high) { return low + below(high - low + 1); }
    QString number(int limit) { return QString::number(below(limit)); }
    QString pick(QStringList const& list) { return list.at(below(int(list.size()))); }

    QString from(char const* characters, int count)
    {
        QString text;
        for (int i = 0; i < count; ++i)
            text += characters[below(int(qstrlen(characters)))];
        return text;
    }

    // No word of the texts below has "zy", "qu" or "wy".
    QString name(int low, int high)
    {
        return pick({"zy", "qu", "wy"}) + from("abdegiklmnoprstu", between(low, high) - 2);
    }

    QString hex(int count) { return from("0123456789abcdef", count); }
    QString base64(int count)
    {
        return from("ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/", count);
    }
    QString letters(int count)
    {
        return from("ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789", count);
    }

    void say(QString const& text)
    {
        m_record.text += text;
        m_record.rest += text;
    }

    void hide(QString const& secret)
    {
        m_record.text += secret;
        m_record.secrets.append(secret);
    }

    void stamp()
    {
        say(QString("2026-11-%1 %2:%3:07.%4 %5 ")
                .arg(below(28) + 1, 2, 10, QChar('0'))
                .arg(below(24), 2, 10, QChar('0'))
                .arg(below(60), 2, 10, QChar('0'))
                .arg(below(1000))
                .arg(pick({"Trace", "Warning", "Error"})));
        if (below(3) == 0)
            say(QString("dT:%1 ").arg(below(100000)));
    }

    void sentence(int limit = 12)
    {
        static const QStringList words = {"cannot",
                                          "open",
                                          "the",
                                          "file",
                                          "of",
                                          "section",
                                          "MainWindow",
                                          "columns",
                                          "read",
                                          "640,480",
                                          "timeout",
                                          "after",
                                          "12.5 s,",
                                          "state",
                                          "std::vector<int>",
                                          "a::b::c",
                                          "0x7ffd3a",
                                          "100%",
                                          "libQt5Core.so.5",
                                          "/usr/lib/x86_64-linux-gnu",
                                          "x=12",
                                          "(code 7)",
                                          "#aabbcc",
                                          "key pressed",
                                          "password accepted",
                                          "token expected",
                                          "retry 3 of 5",
                                          "Qt 5.15.8",
                                          "[main]",
                                          "width=1080",
                                          "5f2b9c8d7e6a5b4c3d2e1f0a9b8c7d6e5f4a3b2c",
                                          "550e8400-e29b-11d4-a716-446655440000",
                                          "https://example.org/a?b=c&d=1#e",
                                          "user@1000.service",
                                          "key=Ctrl+Shift+R",
                                          "1.2 MB",
                                          "-1",
                                          "12:30:00",
                                          "no such device",
                                          "QXcbConnection: XCB error: 3 (BadWindow)",
                                          "sequence: 1841",
                                          "/var/log/app.log.1",
                                          "\"quoted text\"",
                                          "dropped",
                                          "frames:",
                                          "17",
                                          "a@b",
                                          "event::Type"};
        for (int i = between(3, limit); i > 0; --i)
            say(pick(words) + " ");
    }

    void plain()
    {
        if (below(4) == 0) {
            say("    <" + pick({"columns", "panes", "geometry", "zoom", "keys"}) + ">");
            sentence(4);
            say("</item>");
            return;
        }
        stamp();
        sentence();
    }

    // One of the ways to say a name and a value.
    void assigned(QString const& key, QString const& value)
    {
        static const QStringList forms = {"%1=|",
                                          "%1: |",
                                          "\"%1\": \"|\"",
                                          "'%1' => '|'",
                                          "%1=\"|\"",
                                          "<%1>|</%1>",
                                          "<arg key=\"%1\">|</arg>",
                                          "<%1><![CDATA[|]]></%1>",
                                          "{\\\"%1\\\":\\\"|\\\"}",
                                          "<item name=\"%1\" value=\"|\"/>",
                                          "<item value='|' name='%1'/>",
                                          "{\"name\":\"%1\",\"value\":\"|\"}",
                                          "next=x%26%1%3D|%26b",
                                          "?a=1&%1=|&b=2"};
        const QString form = pick(forms);
        say(QString(form.section('|', 0, 0)).replace("%1", key));
        hide(value);
        say(QString(form.section('|', 1)).replace("%1", key) + " ");
    }

    void around(QString const& secret)
    {
        static const QStringList forms = {" |",   " (|)", "=|",   " \"|\"", " '|'",
                                          ": |.", " |,",  " [|]", "<|>",    " |;"};
        const QString form = pick(forms);
        say(form.section('|', 0, 0));
        hide(secret);
        say(form.section('|', 1) + " ");
    }

    QString mail()
    {
        return name(4, 8) + pick({"", "." + name(4, 8), "+x", "_1"}) + pick({"@", "@", "%40"}) +
               name(4, 8) + pick({".org", ".co.uk", ".inner.net", "-x.de"});
    }

    QString ipv4()
    {
        return QString("%1.%2.%3.%4")
            .arg(between(1, 126))
            .arg(below(256))
            .arg(below(256))
            .arg(below(256));
    }

    QString ipv6()
    {
        QStringList groups;
        for (int i = 0; i < 8; ++i)
            groups.append(QString::number(below(65536), 16));
        groups[0] = pick({"2001", "fe80", "fd12", "2a02"});
        if (below(2) == 0)
            return groups.join(':');
        const int kept = between(1, 4);
        return groups.mid(0, kept).join(':') + "::" + groups.mid(8 - between(1, 3)).join(':');
    }

    QString mac()
    {
        QStringList bytes;
        for (int i = 0; i < 6; ++i)
            bytes.append(hex(2));
        bytes[0] = "52";
        return below(2) == 0 ? bytes.join(':') : bytes.join('-').toUpper();
    }

    QString homePath()
    {
        switch (below(4)) {
        case 0:
            return pick({"/home/", "/Users/"}) + name(4, 8);
        case 1:
            return "C:\\Users\\" + name(4, 8);
        case 2:
            return QString::fromLatin1(QUrl::toPercentEncoding(m_home, "/"));
        default:
            return m_home;
        }
    }

    QString knownToken()
    {
        switch (below(5)) {
        case 0:
            return "ghp_" + letters(36);
        case 1:
            return "AKIA" + from("ABCDEFGHIJKLMNOPQRSTUVWXYZ234567", 16);
        case 2:
            return "glpat-" + letters(20);
        case 3:
            return "xoxb-" + from("0123456789", 11) + "-" + letters(24);
        default:
            return "sk_live_" + letters(24);
        }
    }

    void keyBlock()
    {
        const QString kind = pick({"", "RSA ", "EC ", "OPENSSH ", "ENCRYPTED "});
        const QString prefix = pick({"", "", "2026-11-20 14:03:02.007 Trace "});
        say(pick({"key: ", "", "loaded "}));
        QString block = "-----BEGIN " + kind + "PRIVATE KEY-----\n";
        for (int i = between(2, 20); i > 0; --i) {
            const QString line = base64(64);
            block += prefix + line + "\n";
            m_record.secrets.append(line);
        }
        m_record.text +=
            block + prefix + base64(20) + "==\n" + prefix + "-----END " + kind + "PRIVATE KEY-----";
    }

    void planted(int kind)
    {
        ++m_counts[kind];
        if (kind != 11)
            stamp();
        switch (kind) {
        case 0:
            around(pick({m_user, m_user.toUpper()}));
            break;
        case 1:
            around(m_host);
            break;
        case 2:
            say(pick({"", "file://", "path="}));
            hide(homePath());
            say("/x.cfg ");
            break;
        case 3:
            around(mail());
            break;
        case 4:
            around(ipv4());
            break;
        case 5:
            around(ipv6());
            break;
        case 6:
            around(mac());
            break;
        case 7:
            around("eyJ" + letters(between(17, 40)) + "." + letters(between(20, 90)) + "." +
                   letters(43));
            break;
        case 8:
            around(knownToken());
            break;
        case 9:
            assigned(pick({"token", "accessToken", "api_key", "client-secret", "X-Auth-Token"}),
                     below(2) == 0 ? hex(between(20, 64)) : letters(between(20, 64)));
            break;
        case 10:
            say(pick({"https", "ftp", "postgresql"}) + "://" + m_other + ":");
            hide(letters(between(6, 12)) + pick({"", "!x", "$1", "%21", "@"}) + letters(4));
            say("@example.org/" + pick({"", "a?b=c"}) + " ");
            break;
        case 11:
            keyBlock();
            break;
        case 12:
            assigned(pick({"password", "db_password", "pwd", "Passphrase"}),
                     letters(between(8, 20)) + pick({"", "!", "$x", "*y", "-z"}));
            break;
        default:
            around(pick({m_word, m_word.toUpper()}));
            break;
        }
        if (kind != 11)
            sentence(5);
    }

    std::mt19937 m_random;
    QString m_user;
    QString m_other;
    QString m_host;
    QString m_home;
    QString m_word;
    Record m_record;
    int m_counts[Kinds] = {};
};

// The longest text that both contain, in characters that need not be neighbors.
int Common(QString const& a, QString const& b)
{
    std::vector<int> row(size_t(b.size()) + 1);
    for (QChar character : a) {
        int diagonal = 0;
        for (size_t i = 1; i < row.size(); ++i) {
            const int above = row[i];
            row[i] = character == b.at(int(i) - 1) ? diagonal + 1 : std::max(above, row[i - 1]);
            diagonal = above;
        }
    }
    return row.back();
}

// Part of a secret is as bad as all of it.
bool Remains(QString const& secret, QString const& text)
{
    constexpr int Enough = 8;
    for (int i = 0; i == 0 || i + Enough <= secret.size(); ++i) {
        if (text.contains(secret.mid(i, Enough), Qt::CaseInsensitive))
            return true;
    }
    return false;
}

} // namespace

class tst_PlainRedaction : public QObject
{
    Q_OBJECT

private slots:
    void nothingIsLeft();
};

void tst_PlainRedaction::nothingIsLeft()
{
    static const QString separator("\n==== record ====\n");
    static const QRegularExpression placeholder("<[a-z]+(-[0-9]+)?>");
    const int wanted = Rounds::count(5000, 100000, 1000000);
    std::mt19937 seeds(Rounds::seed());
    qint64 planted = 0;
    qint64 rest = 0;
    qint64 changed = 0;
    while (planted < wanted) {
        Generator generator(seeds());
        Redactor redactor;
        generator.Teach(redactor);
        std::vector<Record> records;
        QStringList texts;
        while (generator.Total() < 200) {
            records.push_back(generator.Next());
            texts.append(records.back().text);
        }
        planted += generator.Total();
        const QString redacted = redactor.Redact(texts.join(separator)).text;
        const QStringList results = redacted.split(separator);
        QCOMPARE(size_t(results.size()), records.size());
        for (size_t i = 0; i < records.size(); ++i) {
            Record const& record = records[i];
            const QString result = results.at(int(i));
            for (QString const& secret : record.secrets)
                QVERIFY2(!Remains(secret, result), qPrintable("left of " + secret + "\nin " +
                                                              record.text + "\nas " + result));
            // A text such as "<int>" looks like a placeholder, so all of them are left out.
            const QString before = QString(record.rest).remove(placeholder);
            const QString after = QString(result).remove(placeholder);
            rest += before.size();
            if (before != after) {
                const int common = Common(before, after);
                changed += std::max(before.size(), after.size()) - common;
                if (qEnvironmentVariableIsSet("VELOCOR_SHOW_CHANGED"))
                    std::printf("%s\n%s\n", qPrintable(record.text), qPrintable(result));
            }
        }
    }
    std::printf(
        "plain redaction: %lld secrets of %d kinds, none left; %lld of %lld other characters "
        "changed\n",
        planted, Generator::Kinds, changed, rest);
    QVERIFY(changed * 1000 <= rest);
}

QTEST_GUILESS_MAIN(tst_PlainRedaction)
#include "tst_PlainRedaction.moc"
