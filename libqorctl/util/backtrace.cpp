// Call stacks with function names. Names come from each object file's full
// symbol table (.symtab), so functions that are not exported (static ones,
// split-off cold paths) are named too; without it, from the exported ones.
#include "backtrace.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <cxxabi.h>
#include <dlfcn.h>
#include <elf.h>
#include <execinfo.h>
#include <fcntl.h>
#include <map>
#include <memory>
#include <mutex>
#include <ostream>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include "util/exec.h"

namespace QorCtl {
namespace Util {

namespace {

int const kMaxFrames = 64;

struct Symbol {
    uint64_t start, end;
    std::string name;
};

// The function symbols of one object file, sorted by start address.
struct SymbolTable {
    bool absolute = false;  // a fixed-address executable (not position independent)
    std::vector<Symbol> symbols;

    Symbol const *Find(uint64_t address) const {
        auto it = std::upper_bound(symbols.begin(), symbols.end(), address,
                                   [](uint64_t a, Symbol const &s) { return a < s.start; });
        if (it == symbols.begin())
            return nullptr;
        --it;
        return address < it->end ? &*it : nullptr;
    }
};

void ReadSymbols(char const *data, size_t size, SymbolTable &table) {
    if (size < sizeof(Elf64_Ehdr) || std::memcmp(data, ELFMAG, SELFMAG) != 0 ||
        data[EI_CLASS] != ELFCLASS64)
        return;
    Elf64_Ehdr const *eh = reinterpret_cast<Elf64_Ehdr const *>(data);
    table.absolute = eh->e_type == ET_EXEC;
    if (eh->e_shoff == 0 || eh->e_shentsize != sizeof(Elf64_Shdr) ||
        eh->e_shoff > size || uint64_t(eh->e_shnum) * sizeof(Elf64_Shdr) > size - eh->e_shoff)
        return;
    Elf64_Shdr const *sh = reinterpret_cast<Elf64_Shdr const *>(data + eh->e_shoff);
    for (uint32_t want : {uint32_t(SHT_SYMTAB), uint32_t(SHT_DYNSYM)}) {
        for (unsigned i = 0; i < eh->e_shnum; ++i) {
            Elf64_Shdr const &s = sh[i];
            if (s.sh_type != want || s.sh_link >= eh->e_shnum || s.sh_offset > size ||
                s.sh_size > size - s.sh_offset)
                continue;
            Elf64_Shdr const &str = sh[s.sh_link];
            if (str.sh_offset > size || str.sh_size > size - str.sh_offset)
                continue;
            Elf64_Sym const *sym = reinterpret_cast<Elf64_Sym const *>(data + s.sh_offset);
            for (size_t k = 0; k < s.sh_size / sizeof(Elf64_Sym); ++k) {
                if (ELF64_ST_TYPE(sym[k].st_info) != STT_FUNC || sym[k].st_shndx == SHN_UNDEF ||
                    sym[k].st_value == 0 || sym[k].st_name >= str.sh_size)
                    continue;
                char const *name = data + str.sh_offset + sym[k].st_name;
                size_t len = strnlen(name, str.sh_size - sym[k].st_name);
                uint64_t end = sym[k].st_value + (sym[k].st_size ? sym[k].st_size : 1);
                table.symbols.push_back(Symbol{sym[k].st_value, end, std::string(name, len)});
            }
        }
        if (!table.symbols.empty())
            break;
    }
    std::sort(table.symbols.begin(), table.symbols.end(),
              [](Symbol const &a, Symbol const &b) { return a.start < b.start; });
}

std::shared_ptr<SymbolTable const> TableFor(std::string const &path) {
    static std::mutex mutex;
    static auto *cache = new std::map<std::string, std::shared_ptr<SymbolTable const>>;
    std::lock_guard<std::mutex> lock(mutex);
    auto it = cache->find(path);
    if (it != cache->end())
        return it->second;
    auto table = std::make_shared<SymbolTable>();
    int fd = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
    struct stat st;
    if (fd >= 0 && ::fstat(fd, &st) == 0 && st.st_size > 0) {
        void *map = ::mmap(nullptr, size_t(st.st_size), PROT_READ, MAP_PRIVATE, fd, 0);
        if (map != MAP_FAILED) {
            ReadSymbols(static_cast<char const *>(map), size_t(st.st_size), *table);
            ::munmap(map, size_t(st.st_size));
        }
    }
    if (fd >= 0)
        ::close(fd);
    (*cache)[path] = table;
    return table;
}

std::string Demangle(std::string const &name) {
    int status = 0;
    char *plain = abi::__cxa_demangle(name.c_str(), nullptr, nullptr, &status);
    if (status != 0 || !plain)
        return name;
    std::string result(plain);
    std::free(plain);
    // Spell the standard string the way people write it.
    std::string const longForm =
        "std::__cxx11::basic_string<char, std::char_traits<char>, std::allocator<char> >";
    for (size_t at; (at = result.find(longForm)) != std::string::npos;)
        result.replace(at, longForm.size(), "std::string");
    return result;
}

std::string Hex(uint64_t v) {
    char buf[32];
    std::snprintf(buf, sizeof buf, "0x%llx", (unsigned long long)v);
    return buf;
}

std::string Describe(void *frame) {
    uint64_t address = reinterpret_cast<uint64_t>(frame);
    Dl_info info;
    if (!::dladdr(frame, &info) || !info.dli_fname)
        return Hex(address);
    std::string path = info.dli_fname;
    if (path.empty())
        path = "/proc/self/exe";
    std::string object = path.substr(path.rfind('/') + 1);
    std::shared_ptr<SymbolTable const> table = TableFor(path);
    uint64_t base = reinterpret_cast<uint64_t>(info.dli_fbase);
    uint64_t offset = table->absolute ? address : address - base;
    // A return address may lie just past its function (a call that does not
    // return), so look up the byte before it.
    if (Symbol const *s = table->Find(offset - 1))
        return Demangle(s->name) + "+" + Hex(offset - s->start) + " (" + object + ")";
    if (info.dli_sname)
        return Demangle(info.dli_sname) + "+" +
               Hex(address - reinterpret_cast<uint64_t>(info.dli_saddr)) + " (" + object + ")";
    return Hex(address) + " (" + object + "+" + Hex(address - base) + ")";
}

}  // namespace

std::vector<void *> CaptureStack(int skip) {
    void *frames[kMaxFrames];
    int n = ::backtrace(frames, kMaxFrames);
    int first = skip + 1 < n ? skip + 1 : n;
    return std::vector<void *>(frames + first, frames + n);
}

std::string FormatStack(std::vector<void *> const &frames) {
    std::string text;
    for (size_t i = 0; i < frames.size(); ++i)
        text += "#" + std::to_string(i) + " " + Describe(frames[i]) + "\n";
    return text;
}

void QorCtl_PrintBackTrace(std::ostream &out) {
    out << FormatStack(CaptureStack(0)) << std::flush;
}

}  // namespace Util
}  // namespace QorCtl
