#include "benchmarks/child.h"

#include <array>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <spawn.h>
#include <stdexcept>
#include <unistd.h>

#include <sys/wait.h>

namespace bench {
namespace {

class FileActions {
public:
    FileActions() { posix_spawn_file_actions_init(&actions); }
    ~FileActions() { posix_spawn_file_actions_destroy(&actions); }
    FileActions(const FileActions&) = delete;
    FileActions& operator=(const FileActions&) = delete;
    void open(int descriptor, const char* path, int flags) {
        posix_spawn_file_actions_addopen(&actions, descriptor, path, flags, 0666);
    }
    void use(int source, int descriptor) {
        posix_spawn_file_actions_adddup2(&actions, source, descriptor);
    }

    posix_spawn_file_actions_t actions;
};

pid_t spawn(const Command& command, const FileActions& files) {
    std::vector<char*> arguments;
    for (const std::string& argument : command)
        arguments.push_back(const_cast<char*>(argument.c_str()));
    arguments.push_back(nullptr);
    pid_t process = -1;
    const int failure =
        posix_spawnp(&process, arguments[0], &files.actions, nullptr, arguments.data(), environ);
    return failure == 0 ? process : -1;
}

std::array<int, 2> makePipe() {
    std::array<int, 2> ends;
    if (pipe2(ends.data(), O_CLOEXEC) != 0) throw std::runtime_error("no pipe");
    return ends;
}

}  // namespace

void runProgram(const Command& command, const std::string& outputPath) {
    FileActions files;
    files.open(STDIN_FILENO, "/dev/null", O_RDONLY);
    files.open(STDOUT_FILENO, outputPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC);
    const pid_t process = spawn(command, files);
    int status = -1;
    if (process > 0) waitpid(process, &status, 0);
    if (status != 0) throw std::runtime_error(command[0] + " failed");
}

Interpreter::Interpreter(const Command& command) {
    std::signal(SIGPIPE, SIG_IGN);
    const std::array<int, 2> in = makePipe();
    const std::array<int, 2> out = makePipe();
    FileActions files;
    files.use(in[0], STDIN_FILENO);
    files.use(out[1], STDOUT_FILENO);
    files.open(STDERR_FILENO, "/dev/null", O_WRONLY);
    process = spawn(command, files);
    close(in[0]);
    close(out[1]);
    toChild = fdopen(in[1], "w");
    fromChild = fdopen(out[0], "r");
    there = process > 0 && answer() == "ready";
}

Interpreter::~Interpreter() {
    std::fclose(toChild);
    std::fclose(fromChild);
    if (process > 0) waitpid(process, nullptr, 0);
}

std::string Interpreter::answer() {
    std::string line;
    for (int c; (c = std::getc(fromChild)) != EOF && c != '\n';)
        line += static_cast<char>(c);
    return line;
}

double Interpreter::seconds(const std::vector<std::string>& fields) {
    std::string line;
    for (const std::string& field : fields)
        line += (line.empty() ? "" : "\t") + field;
    std::fputs((line + "\n").c_str(), toChild);
    std::fflush(toChild);
    const std::string text = answer();
    char* end = nullptr;
    const double value = std::strtod(text.c_str(), &end);
    if (text.empty() || *end != '\0') throw std::runtime_error(fields[0] + ": " + text);
    return value;
}

}  // namespace bench
