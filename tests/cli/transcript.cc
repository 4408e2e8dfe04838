#include "tests/cli/transcript.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>

#include <sys/wait.h>

namespace transcript {
namespace {

namespace fs = std::filesystem;

std::string contents(const fs::path& path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

std::string prefixedLines(const std::string& text, const std::string& prefix) {
    std::string lines;
    std::istringstream in(text);
    for (std::string line; std::getline(in, line);)
        lines += prefix + line + '\n';
    return lines;
}

// Blank lines at the end separate one command from the next.
std::string withoutBlankEnd(std::string text) {
    while (text.ends_with("\n\n") || text == "\n")
        text.pop_back();
    return text;
}

}  // namespace

std::vector<Case> read(const std::string& path) {
    std::vector<Case> cases;
    std::ifstream in(path);
    const bool isMarkdown = path.ends_with(".md");
    bool inside = !isMarkdown;
    int number = 0;
    for (std::string line; std::getline(in, line);) {
        ++number;
        if (isMarkdown && line.starts_with("```")) {
            inside = line == "```console";
        } else if (inside && line.starts_with("$ ")) {
            cases.push_back({path, number, line.substr(2), ""});
        } else if (inside && !cases.empty() && !line.starts_with("# ")) {
            cases.back().expected += line + '\n';
        }
    }
    if (cases.empty()) throw std::runtime_error("no command in " + path);
    for (Case& example : cases)
        example.expected = withoutBlankEnd(example.expected);
    return cases;
}

std::string run(const std::string& command, const std::string& program) {
    std::string name = fs::temp_directory_path() / "fileio-cli-XXXXXX";
    if (mkdtemp(name.data()) == nullptr) throw std::runtime_error("no temporary directory");
    const fs::path folder = name;
    fs::create_directories(folder / "home/bin");
    fs::create_symlink(program, folder / "home/bin/fileio");
    std::ofstream(folder / "script") << "cd " << folder << "\nexec >out 2>err\ncd home\n"
                                     << "PATH=\"$PWD/bin:$PATH\"\n"
                                     << command << '\n';
    const int status = std::system(("sh " + (folder / "script").string()).c_str());
    std::string seen = prefixedLines(contents(folder / "out"), "");
    seen += prefixedLines(contents(folder / "err"), "! ");
    fs::remove_all(folder);
    const int exitStatus = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
    if (exitStatus != 0) seen += '[' + std::to_string(exitStatus) + "]\n";
    return withoutBlankEnd(seen);
}

}  // namespace transcript
