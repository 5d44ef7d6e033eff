#include "Support/Program.h"

#include <cstdlib>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <sys/wait.h>

namespace program {

std::string ReadFile(const fs::path& path) {
    std::ifstream file(path, std::ios::binary);
    if (!file || fs::is_directory(path)) return "<missing>";
    std::ostringstream content;
    content << file.rdbuf();
    return content.str();
}

WorkingDirectory::WorkingDirectory() {
    std::string path = (fs::temp_directory_path() / "ovrin-test-XXXXXX").string();
    if (!mkdtemp(path.data())) throw std::runtime_error("no temporary directory");
    m_Path = path;
}

WorkingDirectory::~WorkingDirectory() {
    std::error_code ignored;
    fs::remove_all(m_Path, ignored);
}

void WorkingDirectory::Write(const std::string& name, const std::string& content) const {
    fs::create_directories((m_Path / name).parent_path());
    std::ofstream(m_Path / name, std::ios::binary) << content;
}

std::string WorkingDirectory::Read(const std::string& name) const {
    return ReadFile(m_Path / name);
}

int WorkingDirectory::Run(const std::string& command) const {
    const std::string line = "cd '" + m_Path.string() +
                             "' && OVRIN='" OVRIN_PROGRAM "' && export OVRIN && { " + command +
                             "\n} >stdout 2>stderr </dev/null";
    const int status = std::system(line.c_str());
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

} // namespace program
