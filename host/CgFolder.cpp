#include "CgFolder.h"

#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <system_error>

#include <cerrno>

namespace host {

namespace fs = std::filesystem;

namespace {

/// Changes the working directory as long as it lives.
class WorkingFolder {
public:
    explicit WorkingFolder(const fs::path& folder) : mPrevious(fs::current_path()) {
        fs::current_path(folder);
    }
    ~WorkingFolder() {
        std::error_code ignored;
        fs::current_path(mPrevious, ignored);
    }
    WorkingFolder(const WorkingFolder&) = delete;
    WorkingFolder& operator=(const WorkingFolder&) = delete;

private:
    fs::path mPrevious;
};

fs::path pathOfOwn(const std::string& name) {
    const fs::path folder = fs::read_symlink("/proc/self/exe").parent_path() / FWZEL_DATA_FOLDER;
    return (folder / "Cg" / name).lexically_normal();
}

void throwIfUnreadable(const std::string& file) {
    std::error_code error;
    if (fs::is_directory(file, error))
        throw std::runtime_error(file + ": is a folder");
    errno = 0;
    if (!std::ifstream(file))
        throw std::runtime_error(file + ": " + std::generic_category().message(errno));
}

void throwIfCgFailed(const std::string& file, const std::string& entry) {
    CGerror error = CG_NO_ERROR;
    const char* const reason = cgGetLastErrorString(&error);
    if (error == CG_NO_ERROR)
        return;
    std::string message = file + ", entry " + entry + ": " + (reason ? reason : "it cannot be created");
    const char* const listing = cgGetLastListing(Shader::getCgContext());
    if (listing && *listing != '\0')
        message += std::string("\n") + listing;
    while (message.back() == '\n')
        message.pop_back();
    throw std::runtime_error(message);
}

} // namespace

std::string cgProgramPath(const std::string& name) {
    const fs::path path = pathOfOwn(name);
    if (!fs::exists(path))
        throw std::runtime_error(path.string() + ": the host's Cg program is not there");
    return path.string();
}

std::string findCgProgram(const std::string& file) {
    std::error_code error;
    if (fs::path(file).has_parent_path() || fs::exists(file, error))
        return file;
    const fs::path own = pathOfOwn(file);
    return fs::exists(own, error) ? own.string() : file;
}

Shader makeDefaultVertexShader() {
    const std::string path = cgProgramPath("vertex.cg");
    const WorkingFolder folder(fs::path(path).parent_path().parent_path());
    cgGetError();
    Shader shader;
    throwIfCgFailed(path, "Cg_Main");
    return shader;
}

Shader makeFragmentShader(const std::string& file, const std::string& entry) {
    throwIfUnreadable(file);
    cgGetError();
    Shader shader(Shader::TYPE_FRAGMENT, file, entry);
    throwIfCgFailed(file, entry);
    return shader;
}

} // namespace host
