#include "TrivialClasses.h"

#include <cstdlib>
#include <fstream>
#include <stdexcept>

namespace qelo::bench {
namespace {

// What ZANTH_Account declares beyond what it inherits. Not a subclass of it: whoever asks for
// its instances gets those of its subclasses, too.
constexpr char declarations[] = R"( : CIM_Account {
    string FullName;
    uint32 GroupId;
    string HomeDirectory;
    string ScriptPath;
    datetime passwordLastChanged;
    datetime passwordExpirationDate;
    uint32 daysMustKeepPassword;
    uint32 daysMustChangePasswordAfter;
    uint32 daysWarnBeforePasswordExpire;
    uint32 daysExpireAfter;
    boolean AccountDisable;
};
)";

} // namespace

std::string readyClass(unsigned int count) { return "BENCH_Account" + std::to_string(count); }

std::string freshClass(unsigned int count) { return "BENCH_FreshAccount" + std::to_string(count); }

TrivialClasses::TrivialClasses() {
    std::string name = (std::filesystem::temp_directory_path() / "serverbench-XXXXXX").string();
    if (::mkdtemp(name.data()) == nullptr) {
        throw std::runtime_error("no scratch directory");
    }
    folder_ = name;
    std::ofstream mof(folder_ / "trivial.mof");
    std::ofstream registrations(folder_ / "trivial.reg");
    for (const unsigned int count : trivialCounts) {
        for (const std::string& className : {readyClass(count), freshClass(count)}) {
            mof << "class " << className << declarations;
            registrations << "[" << className << "]\n   provider: TrivialProvider\n"
                          << "   location: qelotrivialprovider\n   type: instance\n"
                          << "   namespace: root/cimv2\n";
        }
    }
}

TrivialClasses::~TrivialClasses() {
    std::error_code ignored;
    std::filesystem::remove_all(folder_, ignored);
}

} // namespace qelo::bench
