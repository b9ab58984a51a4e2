// validate_response [FILE...]: prints what is wrong with response documents, standard input without
// a file. Exit status: 0 nothing, 1 something, 2 a file that cannot be read.
#include <fstream>
#include <iostream>
#include <iterator>

#include "host/server/ResponseValidator.h"

namespace {

/// Whether the document is a good one.
bool accepted(const std::string& name, std::istream& stream) {
    const std::string document{std::istreambuf_iterator<char>(stream), {}};
    const std::vector<std::string> complaints = cmpihost::server::complaintsAbout(document);
    for (const std::string& complaint : complaints) std::cout << name << ": " << complaint << '\n';
    return complaints.empty();
}

}  // namespace

int main(int count, char** arguments) {
    if (count == 1) return accepted("-", std::cin) ? 0 : 1;
    bool good = true;
    for (int index = 1; index < count; ++index) {
        std::ifstream file(arguments[index], std::ios::binary);
        if (!file) {
            std::cerr << arguments[index] << ": cannot be read\n";
            return 2;
        }
        good = accepted(arguments[index], file) && good;
    }
    return good ? 0 : 1;
}
