#include "MofParser.h"

#include "Names.h"

#include <utility>

namespace qelo::schema {
namespace {

constexpr std::size_t kDeepestInclude = 16;
constexpr std::size_t kMostIncludes = 256;
constexpr std::size_t kLargestText = 64U << 20U; // of all files together

// One level of includes, while it lasts.
class Level {
public:
    explicit Level(std::size_t& depth) : depth_(depth) { ++depth_; }
    ~Level() { --depth_; }
    Level(const Level&) = delete;
    Level& operator=(const Level&) = delete;

private:
    std::size_t& depth_;
};

} // namespace

void MofCompilation::read(const MofSource& source) {
    size_ += source.text.size();
    if (size_ > kLargestText) {
        throw SchemaError(source.name + ": the schema is too large");
    }
    const Level level(depth_);
    MofParser(source, *this).parse();
}

void MofCompilation::include(const std::string& including, const std::string& target) {
    if (!include_) {
        throw IncludeError("nothing can be included here");
    }
    if (depth_ >= kDeepestInclude || includes_ >= kMostIncludes) {
        throw IncludeError("too many includes; does a file include itself?");
    }
    ++includes_;
    MofSource source;
    try {
        source = include_(including, target);
    } catch (const std::runtime_error& error) {
        throw IncludeError("cannot include \"" + target + "\": " + error.what());
    }
    read(source);
}

void MofCompilation::setNameSpace(const std::string& nameSpace) {
    nameSpace_ = nameSpace;
    repository_.addNameSpace(nameSpace);
}

void MofCompilation::setAlias(const std::string& name, const cim::ObjectPath& path) {
    if (!aliases_.emplace(foldedName(name), path).second) {
        throw SchemaError("the alias $" + name + " is there already");
    }
}

const cim::ObjectPath* MofCompilation::alias(std::string_view name) const {
    const auto found = aliases_.find(foldedName(name));
    return found == aliases_.end() ? nullptr : &found->second;
}

cim::ObjectPath MofCompilation::reference(const std::string& text, std::string& problem) const {
    auto path = cim::ObjectPath::parse(text, problem);
    if (!path) {
        return {};
    }
    problem.clear();
    if (path->nameSpace().empty()) {
        path->setNameSpace(nameSpace_);
    }
    return std::move(*path);
}

void MofParser::parse() {
    while (tokens_.peek().kind != TokenKind::End) {
        production();
    }
}

void MofParser::production() {
    if (tokens_.atSymbol('#')) {
        pragma();
        return;
    }
    if (tokens_.atKeyword("Qualifier")) {
        qualifierDeclaration();
        return;
    }
    const std::vector<WrittenQualifier> written = qualifierList();
    if (tokens_.atKeyword("class")) {
        classDeclaration(written);
    } else if (tokens_.atKeyword("instance")) {
        instanceDeclaration();
    } else {
        tokens_.failHere("\"class\", \"instance\", \"Qualifier\" or \"#pragma\" is expected");
    }
}

void MofParser::pragma() {
    const Position position = tokens_.peek().position;
    tokens_.expectSymbol('#');
    tokens_.expectKeyword("pragma");
    const std::string name = tokens_.expectName("the name of a pragma");
    tokens_.expectSymbol('(');
    const Initializer argument = tokens_.initializer();
    tokens_.expectSymbol(')');
    const bool include = cim::sameName(name, "include");
    if (!include && !cim::sameName(name, "namespace")) {
        return;
    }
    const Token value = argument.literals.empty() ? Token() : argument.literals.front();
    if (argument.array || value.kind != TokenKind::String || value.value.empty()) {
        tokens_.fail(argument.position, "a string is expected");
    }
    if (!include) {
        compilation_.setNameSpace(value.value);
        return;
    }
    // Errors inside the other file have their own position.
    std::string problem;
    try {
        compilation_.include(source_.name, value.value);
        return;
    } catch (const IncludeError& error) {
        problem = error.what();
    }
    tokens_.fail(position, problem);
}

cim::Value MofParser::typed(const Initializer& initializer,
                            const cim::TypedElement& element) const {
    std::string problem;
    const auto value = typedValue(initializer, element.type, element.array, compilation_, problem);
    if (!value) {
        tokens_.fail(initializer.position, problem);
    }
    if (element.arraySize && !value->isNull() && value->asArray().size() > *element.arraySize) {
        tokens_.fail(initializer.position, "more elements than the array has room for");
    }
    return *value;
}

void readMof(const MofSource& source, const std::string& nameSpace, const IncludeResolver& include,
             ClassRepository& repository) {
    MofCompilation(nameSpace, include, repository).read(source);
}

} // namespace qelo::schema
