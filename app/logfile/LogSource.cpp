// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogSource.h"

#include <algorithm>

namespace Velocor {

std::vector<LogSource::File> LogSource::Files() const
{
    std::vector<File> files;
    if (logs) {
        for (size_t log = 0; log < logs->size(); ++log) {
            for (File file : (*logs)[log].Files()) {
                file.start += static_cast<qint64>(log) * LogSize;
                files.push_back(file);
            }
        }
        return files;
    }
    for (size_t file = 0; older && file < older->count(); ++file)
        files.push_back({older->path(file), older->start(file)});
    files.push_back({path, start()});
    return files;
}

LogSource::File LogSource::FileAt(qint64 offset) const
{
    if (logs) {
        const size_t log = std::min(LogAt(offset), logs->size() - 1);
        const qint64 first = static_cast<qint64>(log) * LogSize;
        File file = (*logs)[log].FileAt(offset - first);
        file.start += first;
        return file;
    }
    const size_t file = older ? older->FileAt(offset) : 0;
    return older && file < older->count() ? File{older->path(file), older->start(file)}
                                          : File{path, start()};
}

} // namespace Velocor
