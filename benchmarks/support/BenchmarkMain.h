// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// Registers the benchmarks of a program, each named "group|contestant". Every program defines it.
///
/// The number of repetitions comes from the command line; the iterations of each are set here, so
/// that all contestants of a group do the same work on files of the same size.
///
/// @param quick  less work, for trying out
void RegisterBenchmarks(bool quick);
