// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/TorkVersion.h"

#include <QVersionNumber>
#include <QtTest>

class tst_TorkVersion : public QObject
{
    Q_OBJECT

private slots:
    void textIsThatOfThePackage();
    void numberIsThatOfTheText();
};

void tst_TorkVersion::textIsThatOfThePackage()
{
    QCOMPARE(TORK_VERSION_STR, PACKAGE_VERSION);
}

void tst_TorkVersion::numberIsThatOfTheText()
{
    const QVersionNumber version = QVersionNumber::fromString(TORK_VERSION_STR);
    QCOMPARE(TORK_VERSION,
             version.majorVersion() << 16 | version.minorVersion() << 8 | version.microVersion());
}

QTEST_APPLESS_MAIN(tst_TorkVersion)
#include "tst_TorkVersion.moc"
