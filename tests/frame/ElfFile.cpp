#include "ElfFile.h"

#include <elf.h>

#include <algorithm>
#include <cstring>
#include <fstream>
#include <sstream>
#include <stdexcept>

namespace qelo::test {

namespace {

class Image {
public:
    explicit Image(const std::string& path) {
        std::ifstream file(path, std::ios::binary);
        std::ostringstream content;
        content << file.rdbuf();
        bytes_ = content.str();
        if (bytes_.compare(0, SELFMAG, ELFMAG) != 0 || bytes_.at(EI_CLASS) != ELFCLASS64) {
            throw std::runtime_error(path + " is not a 64-bit ELF file");
        }
    }

    template <class Structure> Structure at(std::size_t offset) const {
        Structure structure;
        if (offset > bytes_.size() || bytes_.size() - offset < sizeof structure) {
            throw std::runtime_error("the ELF file is cut short");
        }
        std::memcpy(&structure, bytes_.data() + offset, sizeof structure);
        return structure;
    }

    std::string text(std::size_t offset) const { return bytes_.c_str() + std::min(offset, size()); }

    // The section of a type; every library has one dynamic section and one symbol table.
    Elf64_Shdr section(unsigned int type) const {
        const auto header = at<Elf64_Ehdr>(0);
        for (std::size_t i = 0; i < header.e_shnum; ++i) {
            const auto candidate = sectionAt(i);
            if (candidate.sh_type == type) {
                return candidate;
            }
        }
        throw std::runtime_error("the ELF file lacks a section");
    }

    Elf64_Shdr sectionAt(std::size_t index) const {
        const auto header = at<Elf64_Ehdr>(0);
        return at<Elf64_Shdr>(header.e_shoff + index * header.e_shentsize);
    }

private:
    std::size_t size() const { return bytes_.size(); }
    std::string bytes_;
};

template <class Entry, class Visit>
void forEachEntry(const Image& image, const Elf64_Shdr& section, Visit visit) {
    for (std::size_t i = 0; i < section.sh_size / sizeof(Entry); ++i) {
        visit(image.at<Entry>(section.sh_offset + i * sizeof(Entry)));
    }
}

} // namespace

ElfFile readElfFile(const std::string& path) {
    const Image image(path);
    ElfFile file;
    const Elf64_Shdr dynamic = image.section(SHT_DYNAMIC);
    const std::size_t names = image.sectionAt(dynamic.sh_link).sh_offset;
    forEachEntry<Elf64_Dyn>(image, dynamic, [&](const Elf64_Dyn& entry) {
        if (entry.d_tag == DT_NEEDED) {
            file.needed.push_back(image.text(names + entry.d_un.d_val));
        } else if (entry.d_tag == DT_SONAME) {
            file.soname = image.text(names + entry.d_un.d_val);
        }
    });
    forEachEntry<Elf64_Sym>(image, image.section(SHT_DYNSYM), [&](const Elf64_Sym& symbol) {
        if (symbol.st_shndx != SHN_UNDEF) {
            file.definedSymbols.push_back(image.text(names + symbol.st_name));
        }
    });
    std::sort(file.definedSymbols.begin(), file.definedSymbols.end());
    return file;
}

} // namespace qelo::test
