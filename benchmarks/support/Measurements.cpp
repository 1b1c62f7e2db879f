// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "support/Measurements.h"

#include "support/ScratchFolder.h"

#include <QFile>
#include <QJsonDocument>
#include <QJsonObject>

#include <algorithm>
#include <cmath>

namespace {

QString NameOf(QString const& group, char const* contestant)
{
    return group + '|' + QLatin1String(contestant);
}

double Percentile(std::vector<double> const& sorted, double share)
{
    const double rank = std::ceil(share * double(sorted.size()));
    return sorted[std::max<size_t>(1, size_t(rank)) - 1];
}

} // namespace

void Measurements::add(QString const& group, char const* contestant, double value, char const* unit,
                       double processorValue)
{
    m_measurements.append(QJsonObject{{"name", NameOf(group, contestant)},
                                      {"run_type", "iteration"},
                                      {"threads", 1},
                                      {"iterations", 1},
                                      {"real_time", value},
                                      {"cpu_time", processorValue},
                                      {"time_unit", unit}});
}

void Measurements::add(QString const& group, char const* contestant, double value, char const* unit)
{
    add(group, contestant, value, unit, value);
}

void Measurements::addRow(QString const& group, char const* contestant,
                          std::vector<Figure> const& figures)
{
    QJsonArray columns;
    for (Figure const& figure : figures)
        columns.append(QJsonArray{figure.name, figure.value, figure.unit});
    m_measurements.append(QJsonObject{{"name", NameOf(group, contestant)},
                                      {"run_type", "row"},
                                      {"threads", 1},
                                      {"columns", columns}});
}

void Measurements::addPercentiles(QString const& group, char const* contestant,
                                  std::vector<double> times)
{
    std::sort(times.begin(), times.end());
    addRow(group, contestant,
           {{"p50", Percentile(times, 0.5), "ns"},
            {"p99", Percentile(times, 0.99), "ns"},
            {"p99.9", Percentile(times, 0.999), "ns"},
            {"worst", times.back(), "ns"}});
}

void Measurements::save(QString const& fileName) const
{
    QFile file(fileName);
    Require(file.open(QIODevice::WriteOnly), file.errorString());
    file.write(QJsonDocument(QJsonObject{{"benchmarks", m_measurements}}).toJson());
}
