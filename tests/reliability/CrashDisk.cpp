// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "reliability/CrashDisk.h"

#include <QSet>

#include <fcntl.h>

using DiskRecorder::Operation;

namespace {

// The bytes over what is there; what lies between is NULs.
void Overlay(QByteArray& content, qint64 offset, QByteArray const& bytes)
{
    const int start = static_cast<int>(offset);
    if (content.size() < start)
        content.append(QByteArray(start - content.size(), '\0'));
    content.replace(start, qMin(bytes.size(), content.size() - start), bytes);
}

void Resize(QByteArray& content, qint64 size)
{
    const int before = content.size();
    content.resize(static_cast<int>(size));
    if (before < content.size())
        std::fill(content.begin() + before, content.end(), '\0');
}

bool OneIn(int many, std::mt19937& random)
{
    return random() % static_cast<unsigned>(many) == 0;
}

} // namespace

QByteArray CrashDisk::folderOf(QByteArray const& path)
{
    return path.left(path.lastIndexOf('/') + 1);
}

bool CrashDisk::isNaming(Step const& step)
{
    switch (step.kind) {
    case DiskRecorder::Open: // only those that create
    case DiskRecorder::Rename:
    case DiskRecorder::Link:
    case DiskRecorder::Unlink:
    case DiskRecorder::MakeFolder:
        return true;
    default:
        return false;
    }
}

CrashDisk::CrashDisk(State const& base, QVector<Operation> const& record) : m_base(base)
{
    int nodes = 0;
    for (File& file : m_base.files) {
        file.node = ++nodes;
        m_contents[file.node] = file.content;
    }

    // The names as they are at each operation tell which file it concerns.
    State now = m_base;
    QMap<quint64, int> open;           // nodes
    QMap<quint64, QByteArray> folders; // open ones
    for (Operation const& operation : record) {
        Step step;
        step.kind = operation.kind;
        step.offset = operation.offset;
        step.path = operation.path;
        step.target = operation.target;
        step.bytes = operation.bytes;
        switch (operation.kind) {
        case DiskRecorder::Open: {
            QByteArray folder = operation.path;
            if (folder == "." || folder.endsWith("/.")) // a folder in itself
                folder.chop(1);
            if (!folder.isEmpty() && !folder.endsWith('/'))
                folder += '/';
            const bool isUnnamed = (operation.flags & O_TMPFILE) == O_TMPFILE;
            const bool isFolder = !isUnnamed && (folder.isEmpty() || now.folders.contains(folder));
            const bool isThere = now.files.contains(operation.path);
            folders.remove(operation.file);
            open.remove(operation.file);
            if (isFolder) {
                folders[operation.file] = folder;
                step.kind = DiskRecorder::Mark;
            } else {
                step.node = isThere ? now.files[operation.path].node : ++nodes;
                open[operation.file] = step.node;
                if (isThere && (operation.flags & O_TRUNC))
                    step.kind = DiskRecorder::Truncate;
                else if (isThere || isUnnamed)
                    step.kind = DiskRecorder::Mark;
            }
            break;
        }
        case DiskRecorder::Write:
        case DiskRecorder::Truncate:
        case DiskRecorder::Sync:
            step.node = open.value(operation.file);
            if (folders.contains(operation.file))
                step.path = folders[operation.file];
            break;
        case DiskRecorder::Link:
            step.node =
                operation.file ? open.value(operation.file) : now.files.value(operation.path).node;
            break;
        case DiskRecorder::Rename:
        case DiskRecorder::Unlink:
            step.node = now.files.value(operation.path).node;
            break;
        case DiskRecorder::Close:
        case DiskRecorder::MakeFolder:
        case DiskRecorder::Mark:
            break;
        }
        if (isNaming(step))
            name(now, step);
        m_steps.append(step);
    }
}

void CrashDisk::name(State& state, Step const& step)
{
    switch (step.kind) {
    case DiskRecorder::Open:
        state.files[step.path].node = step.node;
        break;
    case DiskRecorder::Rename:
        state.files.remove(step.path);
        state.files[step.target].node = step.node;
        break;
    case DiskRecorder::Link:
        state.files[step.target].node = step.node;
        break;
    case DiskRecorder::Unlink:
        if (state.files.value(step.path).node == step.node)
            state.files.remove(step.path);
        break;
    case DiskRecorder::MakeFolder:
        state.folders.insert(step.path.endsWith('/') ? step.path : step.path + '/');
        break;
    default:
        break;
    }
}

// Whether a step before `end` is on the disk for certain.
bool CrashDisk::isSynced(int number, int end) const
{
    Step const& step = m_steps[number];
    for (int i = number + 1; i < end; ++i) {
        Step const& sync = m_steps[i];
        if (sync.kind != DiskRecorder::Sync)
            continue;
        if (isNaming(step)) {
            QByteArray const& path = step.target.isEmpty() ? step.path : step.target;
            if (sync.node == 0 && sync.path == folderOf(path))
                return true;
        } else if (sync.node == step.node && sync.node != 0) {
            return true;
        }
    }
    return false;
}

QByteArray CrashDisk::contentAt(int node, int end, Crash crash, std::mt19937& random) const
{
    QByteArray content = m_contents.value(node);
    for (int i = 0; i < end; ++i) {
        Step const& step = m_steps[i];
        if (step.node != node ||
            (step.kind != DiskRecorder::Write && step.kind != DiskRecorder::Truncate))
            continue;
        const bool isCertain = crash == Killed || isSynced(i, end);
        // Whole, not at all, torn, or only the new size.
        const int choice = isCertain ? 0 : static_cast<int>(random() % 4);
        if (step.kind == DiskRecorder::Truncate) {
            if (choice == 0 || choice == 2)
                Resize(content, step.offset);
            continue;
        }
        const int part = static_cast<int>(random() % static_cast<unsigned>(step.bytes.size() + 1));
        if (choice == 0)
            Overlay(content, step.offset, step.bytes);
        else if (choice == 2)
            Overlay(content, step.offset, step.bytes.left(part));
        else if (choice == 3 && content.size() < step.offset + step.bytes.size())
            Resize(content, step.offset + step.bytes.size());
    }
    // A kill comes in the middle of a write.
    if (crash == Killed && end < m_steps.size() && m_steps[end].node == node &&
        m_steps[end].kind == DiskRecorder::Write) {
        QByteArray const& bytes = m_steps[end].bytes;
        const int part = static_cast<int>(random() % static_cast<unsigned>(bytes.size() + 1));
        Overlay(content, m_steps[end].offset, bytes.left(part));
    }
    return content;
}

CrashDisk::State CrashDisk::stateAt(int end, Crash crash, std::mt19937& random) const
{
    // In order: up to some change after the last that is on the disk for certain.
    QVector<int> names;
    int certain = 0;
    for (int i = 0; i < end; ++i) {
        if (!isNaming(m_steps[i]))
            continue;
        names.append(i);
        if (crash != Killed && isSynced(i, end))
            certain = names.size();
    }
    const int uncertain = names.size() - certain;
    const int last =
        crash == PowerCut
            ? certain + static_cast<int>(random() % static_cast<unsigned>(uncertain + 1))
            : names.size();

    State state = m_base;
    for (int i = 0; i < last; ++i) {
        Step const& step = m_steps[names[i]];
        const bool isDropped = crash == AnyOrderCut && step.kind != DiskRecorder::MakeFolder &&
                               !isSynced(names[i], end) && OneIn(2, random);
        if (!isDropped)
            name(state, step);
    }
    QMap<int, QByteArray> contents; // once for each file, whatever its names
    for (File& file : state.files) {
        if (!contents.contains(file.node))
            contents[file.node] = contentAt(file.node, end, crash, random);
        file.content = contents[file.node];
    }
    return state;
}

int CrashDisk::openOperations(int end) const
{
    int count = 0;
    for (int i = 0; i < end; ++i) {
        const bool changes = isNaming(m_steps[i]) || m_steps[i].kind == DiskRecorder::Write ||
                             m_steps[i].kind == DiskRecorder::Truncate;
        count += changes && !isSynced(i, end);
    }
    return count;
}
