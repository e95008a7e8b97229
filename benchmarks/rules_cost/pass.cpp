// The one pass over files, in a program of its own: what `analyze(text).problems` does without an
// interpreter. Linked with no_rules.cpp and no_declarations.cpp it is the same pass without the rules after
// the grammar.

#include <filesystem>
#include <fstream>
#include <iostream>
#include <string>

#include "file/file_analyzer.h"

int main(int count, char** arguments) {
    size_t problem_count = 0;
    codeloom::CFileSettings settings;
    settings.wants_records = false;
    for (int i = 1; i < count; ++i) {
        std::string text(std::filesystem::file_size(arguments[i]), '\0');
        std::ifstream(arguments[i], std::ios::binary)
            .read(text.data(), static_cast<std::streamsize>(text.size()));
        problem_count += codeloom::AnalyzeFile(text, settings, {}).problems.size();
    }
    std::cout << problem_count << " problems\n";
}
