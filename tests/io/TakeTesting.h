// What the tests of take files share.
#pragma once

#include <functional>
#include <random>
#include <string>

#include "io/Take.h"
#include "tests/TempFolder.h"

namespace talix {

using talix_tests::readText;
using talix_tests::TempFolder;

std::string dataFile(std::string const& name);

// The text of the FileError that `work` throws; empty when it throws none.
std::string errorOf(std::function<void()> const& work);

// All notes, a line each.
std::string notesOf(std::vector<TakeNote> const& notes);

// The first difference between what two takes hold; empty: none. How a file held it does not count: format,
// name, variant, notes, analog scaling. Numbers may differ by `tolerance` times their size (at least 1),
// rotations by 1e-10 at most.
std::string differenceOf(Take const& a, Take const& b, double tolerance = 1e-9);

// Reads every shortened and many damaged forms of a file's content: each must give a take or a FileError that
// names the file. `damages` random changes of one to four bytes come from a fixed seed.
void expectSurvivesDamage(std::string const& content, std::string const& suffix, size_t step, int damages,
                          std::function<Take(std::string const& path)> const& read);

}  // namespace talix
