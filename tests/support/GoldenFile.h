#ifndef TESTS_SUPPORT_GOLDEN_FILE_H
#define TESTS_SUPPORT_GOLDEN_FILE_H

#include <string>

/// Fails the test unless the file holds just this text, and shows the lines that differ. With
/// UPDATE_GOLDEN=1 in the environment it writes the file instead: what changed is then for whoever
/// reads the commit.
void expectGolden(const std::string& file, const std::string& actual);

#endif
