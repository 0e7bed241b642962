#include <oecore/core/exception.h>
#include <oecore/core/log.h>

#include <unistd.h>
#include <cstdio>
#include <filesystem>
#include <system_error>

OMB_DEFINE_ENGINE_CLASS(OmbLogAppender, OmbEngineObject, "LogAppender", 0)
OMB_DEFINE_ENGINE_CLASS(OmbDebuggerLogAppender, OmbLogAppender, "DebuggerLogAppender", 0)
OMB_DEFINE_ENGINE_CLASS(OmbRollingFileLogAppender, OmbLogAppender, "RollingFileLogAppender", 0)

namespace fs = std::filesystem;

void OmbDebuggerLogAppender::log(const OmbString& line, OmbLogLevel) const {
    // One write per line keeps lines of different threads apart.
    const std::string text = std::string(line.view()) + "\n";
    [[maybe_unused]] const ssize_t written = ::write(STDERR_FILENO, text.data(), text.size());
}

OmbRollingFileLogAppender::OmbRollingFileLogAppender(const OmbString& fileName, unsigned fileCount,
                                                     unsigned maximumFileSize)
    : fileName_(fileName), fileCount_(fileCount), maximumFileSize_(maximumFileSize) {
    if (fileCount == 0) OMB_THROW(Argument, OmbString::literal("Number of log files must be greater than zero."));
    const fs::path path(std::string(fileName.view()));
    if (!path.has_extension() || !path.has_stem()) OMB_THROW(Argument, OmbString::literal("Invalid log file"));
    const fs::path directory = path.has_parent_path() ? path.parent_path() : fs::path(".");
    std::error_code error;
    fs::create_directories(directory, error);
    if (!fs::is_directory(directory, error)) OMB_THROW(Argument, OmbString::literal("Invalid log file"));
    directory_ = OmbString(directory.string());
    baseName_ = OmbString(path.stem().string());
    extension_ = OmbString(path.extension().string().substr(1));
}

OmbRollingFileLogAppender::OmbRollingFileLogAppender(const OmbRollingFileLogAppender& other)
    : OmbLogAppender(other),
      fileName_(other.fileName_),
      fileCount_(other.fileCount_),
      maximumFileSize_(other.maximumFileSize_),
      directory_(other.directory_),
      baseName_(other.baseName_),
      extension_(other.extension_) {}

OmbRollingFileLogAppender::~OmbRollingFileLogAppender() {
    if (file_) std::fclose(file_);
}

OmbString OmbRollingFileLogAppender::indexedFileName(unsigned index) const {
    if (index == 0) return fileName_;
    const fs::path name =
        std::string(baseName_.view()) + "." + std::to_string(index) + "." + std::string(extension_.view());
    return OmbString((fs::path(std::string(directory_.view())) / name).string());
}

void OmbRollingFileLogAppender::rotate() const {
    std::fclose(file_);
    file_ = nullptr;
    std::error_code error;
    if (fileCount_ == 1) {
        fs::remove(fileName_.dataUtf8(), error);
        return;
    }
    for (unsigned i = fileCount_ - 1; i-- > 0;) {
        const fs::path from(indexedFileName(i).dataUtf8());
        if (!fs::exists(from, error)) continue;
        const fs::path to(indexedFileName(i + 1).dataUtf8());
        fs::remove(to, error);
        fs::rename(from, to, error);
    }
}

namespace {

// Opens for appending, positioned at the end so that ftell is the size.
std::FILE* openForAppend(const OmbString& name) {
    std::FILE* file = std::fopen(name.dataUtf8(), "a");
    if (file) std::fseek(file, 0, SEEK_END);
    return file;
}

}  // namespace

// The log mutex serialises calls, so the file handle needs no lock of its own.
void OmbRollingFileLogAppender::log(const OmbString& line, OmbLogLevel) const {
    if (!file_) file_ = openForAppend(fileName_);
    if (!file_) return;
    if (std::ftell(file_) > static_cast<long>(maximumFileSize_)) {
        rotate();
        file_ = openForAppend(fileName_);
        if (!file_) return;
    }
    const std::string text = line.toActiveCPIgnoreErrors();
    std::fwrite(text.data(), 1, text.size(), file_);
    std::fputc('\n', file_);
    std::fflush(file_);
}
