// A host that is not linked against the library: it loads libFwZel.so, which finds the log function in the
// process.

#include <FwZel/CgResource.h>
#include <FwZel/kxsys_syslog.h>

#include <dlfcn.h>

#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <new>
#include <string>

extern "C" __attribute__((visibility("default"))) void kxsys_syslog(int level, const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    std::printf("log, level %d: ", level);
    std::vprintf(format, arguments);
    va_end(arguments);
}

namespace {

template <class Result>
Result orEnd(Result result) {
    if (!result) {
        std::fprintf(stderr, "loading_host: %s\n", dlerror());
        std::exit(1);
    }
    return result;
}

} // namespace

int main(int argc, char** argv) {
    // RTLD_LAZY: the library itself asks that a missing log function is noticed here, not at its first
    // message.
    void* const library = orEnd(dlopen(argc > 1 ? argv[1] : "libFwZel.so.1", RTLD_LAZY));
    const auto construct = reinterpret_cast<void (*)(void*)>(orEnd(dlsym(library, "_ZN10CgResourceC1Ev")));
    const auto typeOf = reinterpret_cast<uint32_t (*)(const void*, std::string)>(orEnd(
        dlsym(library,
              "_ZNK10CgResource17getCgResourceTypeENSt7__cxx1112basic_stringIcSt11char_traitsIcESaIcEEE")));
    alignas(CgResource) unsigned char memory[sizeof(CgResource)];
    construct(memory);
    std::printf("slot %#x\n", typeOf(memory, "texture"));
    std::launder(reinterpret_cast<CgResource*>(memory))->~CgResource();
    return 0;
}
