// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Most-recently-used lists, against a model that works on a list of texts.

#include "FuzzInput.h"

#include "app/AppUtils.h"

#include <QStringList>

namespace {

bool UpdateModel(QString const& file, QStringList& entries, int maxCount, int op)
{
    const int position = entries.indexOf(file);
    if (file.isEmpty() || op < 0 || op > 1 || (op == AppUtils::MRURemove && position < 0))
        return false;

    if (position >= 0)
        entries.removeAt(position);
    if (op == AppUtils::MRUAdd)
        entries.prepend(file);
    while (entries.size() > qMax(0, maxCount))
        entries.removeLast();
    // Joined and split again: separators inside an entry split it, and empty entries disappear.
    entries = entries.join("|").split("|");
    return true;
}

bool Update(QString const& file, QString& list, int maxCount, int op)
{
    if (op == AppUtils::MRURemove && maxCount == 10)
        return AppUtils::RemoveFromMRUList(file, list);
    if (op == AppUtils::MRUAdd && maxCount == 10)
        return AppUtils::AddToMRUList(file, list, maxCount);
    return AppUtils::UpdateMRUList(file, list, maxCount, static_cast<AppUtils::MRUOpCode>(op));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    FuzzInput input(data, size);
    QString list = input.text();
    QStringList model = list.split("|");

    while (!input.atEnd()) {
        const QString file = input.text();
        const int maxCount = static_cast<signed char>(input.byte());
        const int op = static_cast<signed char>(input.byte()) % 3;
        const QString before = list;
        const bool changed = Update(file, list, maxCount, op);
        Require(changed == UpdateModel(file, model, maxCount, op));
        Require(changed || list == before);
        Require(list.split("|") == model);
    }
    return 0;
}
