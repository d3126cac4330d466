#include "support/program.h"

#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>

namespace partnerkit::testing {

namespace {

std::string Contents(std::FILE* file) {
  std::string text;
  std::rewind(file);
  for (int c = std::fgetc(file); c != EOF; c = std::fgetc(file)) text += static_cast<char>(c);
  std::fclose(file);
  return text;
}

}  // namespace

Ran RunPartnerkit(const std::string& folder, const std::vector<std::string>& arguments,
                  const std::string& environmentWorkspace) {
  std::FILE* out = std::tmpfile();
  std::FILE* err = std::tmpfile();
  if (out == nullptr || err == nullptr) std::abort();
  std::string program = PARTNERKIT_PROGRAM;
  std::vector<std::string> words = arguments;
  std::vector<char*> argv = {program.data()};
  for (std::string& word : words) argv.push_back(word.data());
  argv.push_back(nullptr);

  const pid_t child = fork();
  if (child == 0) {
    unsetenv("PARTNERKIT_WORKSPACE");
    unsetenv("COLUMNS");
    if (!environmentWorkspace.empty()) setenv("PARTNERKIT_WORKSPACE", environmentWorkspace.c_str(), 1);
    if (chdir(folder.c_str()) != 0 || dup2(fileno(out), STDOUT_FILENO) < 0 || dup2(fileno(err), STDERR_FILENO) < 0) {
      _exit(126);
    }
    execv(program.c_str(), argv.data());
    _exit(127);
  }
  int status = 0;
  waitpid(child, &status, 0);
  const int code = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
  return {code, Contents(out), Contents(err)};
}

}  // namespace partnerkit::testing
