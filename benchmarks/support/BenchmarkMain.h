// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// Registers the benchmarks of a program, each named "group|contestant". Every program has one.
///
/// The number of repetitions is the command line's; the iterations of each are set here, so that
/// all contestants of a group do the same work on files of the same size.
///
/// @param quick  smaller amounts of work, for trying out
void RegisterBenchmarks(bool quick);
