// MOF in files.
#include "MofLexer.h"

#include <algorithm>
#include <fstream>
#include <iterator>
#include <set>
#include <system_error>

namespace qelo::schema {
namespace {

namespace fs = std::filesystem;

constexpr std::size_t kLargestFile = 32U << 20U;

// Where a file lies with all links and dots resolved, as far as it exists.
fs::path resolvedPath(const fs::path& file) {
    std::error_code error;
    fs::path path = fs::weakly_canonical(file, error);
    return error ? fs::absolute(file) : path;
}

bool liesBelow(const fs::path& folder, const fs::path& file) {
    const auto [end, ignored] =
        std::mismatch(folder.begin(), folder.end(), file.begin(), file.end());
    return end == folder.end();
}

// The strings of the include pragmas of a text. What is wrong with the text is left to those
// who read it in earnest.
std::vector<std::string> includesOf(const MofSource& source) {
    std::vector<std::string> targets;
    try {
        MofLexer lexer(source);
        std::string last;
        for (Token token = lexer.next(); token.kind != TokenKind::End; token = lexer.next()) {
            if (token.kind == TokenKind::String && last == "#pragmainclude(") {
                targets.push_back(token.value);
            }
            if (token.text == "#") {
                last.clear();
            }
            last += token.text;
            if (last.size() > std::string_view("#pragmainclude(").size()) {
                last.clear();
            }
        }
    } catch (const SchemaError&) {
        return targets;
    }
    return targets;
}

} // namespace

std::string readSchemaFile(const fs::path& file) {
    std::error_code error;
    if (!fs::is_regular_file(file, error)) {
        throw SchemaError(file.string() + ": " + (error ? error.message() : "not a file"));
    }
    std::ifstream stream(file, std::ios::binary);
    std::string text;
    char block[65536];
    while (stream.read(block, sizeof block) || stream.gcount() > 0) {
        text.append(block, static_cast<std::size_t>(stream.gcount()));
        if (text.size() > kLargestFile) {
            throw SchemaError(file.string() + ": the file is too large");
        }
    }
    if (!stream.eof()) {
        throw SchemaError(file.string() + ": cannot be read");
    }
    return text;
}

void loadMofFile(const fs::path& file, const std::string& nameSpace, ClassRepository& repository) {
    const fs::path root = resolvedPath(file).parent_path();
    const IncludeResolver include = [&root](const std::string& including,
                                            const std::string& target) {
        const fs::path wanted = resolvedPath(fs::path(including).parent_path() / target);
        if (!liesBelow(root, wanted)) {
            throw std::runtime_error("it is outside of the folder of the schema");
        }
        return MofSource{wanted.string(), readSchemaFile(wanted)};
    };
    readMof({resolvedPath(file).string(), readSchemaFile(file)}, nameSpace, include, repository);
}

std::vector<fs::path> schemaFiles(const fs::path& folder, std::string_view extension) {
    std::error_code error;
    std::vector<fs::path> files;
    for (fs::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        if (entry->path().extension() == extension) {
            files.push_back(entry->path());
        }
    }
    if (error) {
        throw SchemaError(folder.string() + ": " + error.message());
    }
    std::sort(files.begin(), files.end());
    return files;
}

void loadMofFolder(const fs::path& folder, const std::string& nameSpace,
                   ClassRepository& repository) {
    const std::vector<fs::path> files = schemaFiles(folder, ".mof");
    std::set<fs::path> included;
    for (const fs::path& file : files) {
        for (const std::string& target : includesOf({file.string(), readSchemaFile(file)})) {
            included.insert(resolvedPath(file.parent_path() / target));
        }
    }
    for (const fs::path& file : files) {
        if (included.count(resolvedPath(file)) == 0) {
            loadMofFile(file, nameSpace, repository);
        }
    }
}

} // namespace qelo::schema
