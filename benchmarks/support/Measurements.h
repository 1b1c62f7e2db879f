// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QJsonArray>
#include <QString>

#include <vector>

/// The results of a program that measures by itself, in the format of Google Benchmark.
class Measurements
{
public:
    /// One figure of a row of several: `unit` is "ns", or empty for a plain number.
    struct Figure
    {
        char const* name;
        double value;
        char const* unit;
    };

    /// Adds one measurement of a contestant in a group.
    ///
    /// @param unit            "ns" or "KiB"
    /// @param processorValue  the same as processor time, where that is something else
    void add(QString const& group, char const* contestant, double value, char const* unit,
             double processorValue);
    void add(QString const& group, char const* contestant, double value, char const* unit);

    /// Adds a row of figures that are printed as they are, one column each. All rows of a group
    /// have the same columns.
    void addRow(QString const& group, char const* contestant, std::vector<Figure> const& figures);

    /// The same for times in nanoseconds, of which those are shown that shares of them did not
    /// exceed.
    void addPercentiles(QString const& group, char const* contestant, std::vector<double> times);

    /// Writes all of them; exits if that fails.
    void save(QString const& fileName) const;

private:
    QJsonArray m_measurements;
};
