// A small driver for compilers that bring none: makes inputs from seeds and runs them, or runs files.
//
// The runs are made in a child process, so that whatever ends it, a failed check, a sanitizer or a run that
// does not come back, the parent still tells the seed and keeps the input in a file.

#include "support/Check.h"
#include "support/Family.h"

#include <atomic>
#include <charconv>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iterator>
#include <new>
#include <random>
#include <string>
#include <string_view>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

namespace {

using namespace PKFuzz;
using Clock = std::chrono::steady_clock;

constexpr char kUsage[] =
    "usage: pixelkiln_fuzz [--seconds N | --runs N] [--seed S] [--family NAME] [--verbose]\n"
    "       pixelkiln_fuzz [--verbose] FILE...\n"
    "\n"
    "Calls the library with random arguments and checks what it does. Run n of a session has the seed S + "
    "n;\n"
    "a run that fails is made again by --runs 1 --seed and its seed. Without --seed, seeds begin anywhere.\n"
    "A FILE is the input of one run, as a failure leaves it behind.\n";

constexpr unsigned kSecondsOfRun = 60;

struct Options {
    uint64_t runs = 10000;
    uint64_t seconds = 0; // 0: as many as there are runs
    uint64_t seed = std::random_device{}();
    const Family* family = nullptr; // null: all in turn
    std::vector<std::string> files;
};

/// What the parent needs to know of the child, in memory that both have.
struct Progress {
    std::atomic<uint64_t> seed;
    std::atomic<uint64_t> runs;
    std::atomic<bool> isDone;
};

[[noreturn]] void Refuse(const std::string& why) {
    std::fprintf(stderr, "%s\n%s", why.c_str(), kUsage);
    std::exit(2);
}

uint64_t ParseNumber(std::string_view option, std::string_view text) {
    uint64_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc{} || end != text.data() + text.size())
        Refuse(std::string(option) + " wants a number");
    return number;
}

const Family* FindFamily(std::string_view name) {
    std::string known;
    for (const Family* family : Family::All()) {
        if (family->Name() == name) return family;
        known.append(" ").append(family->Name());
    }
    Refuse("no such family; there are:" + known);
}

Options Parse(int count, char** arguments) {
    Options options;
    for (int i = 1; i < count; ++i) {
        const std::string_view option = arguments[i];
        const auto value = [&] {
            if (++i == count) Refuse(std::string(option) + " wants a value");
            return std::string_view(arguments[i]);
        };
        if (option == "--runs")
            options.runs = ParseNumber(option, value());
        else if (option == "--seconds")
            options.seconds = ParseNumber(option, value());
        else if (option == "--seed")
            options.seed = ParseNumber(option, value());
        else if (option == "--family")
            options.family = FindFamily(value());
        else if (option == "--verbose")
            SetVerbose(true);
        else if (option.starts_with("-"))
            Refuse("unknown option " + std::string(option));
        else
            options.files.emplace_back(option);
    }
    return options;
}

/// The input of a seed: the letter of a family, then noise.
std::vector<uint8_t> MakeInput(uint64_t seed, const Options& options) {
    std::mt19937_64 engine(seed);
    const std::vector<const Family*>& families = Family::All();
    const Family& family = options.family ? *options.family : *families[engine() % families.size()];
    std::vector<uint8_t> input(64 + engine() % 256);
    for (uint8_t& byte : input) byte = static_cast<uint8_t>(engine());
    input[0] = static_cast<uint8_t>(family.Letter());
    return input;
}

void RunSeeds(const Options& options, Progress& progress) {
    const Clock::time_point end = Clock::now() + std::chrono::seconds(options.seconds);
    const auto isOver = [&] {
        return options.seconds != 0 ? Clock::now() >= end : progress.runs == options.runs;
    };
    for (; !isOver(); ++progress.runs) {
        progress.seed = options.seed + progress.runs;
        const std::vector<uint8_t> input = MakeInput(progress.seed, options);
        alarm(kSecondsOfRun); // a run that does not come back is a failure too
        LLVMFuzzerTestOneInput(input.data(), input.size());
    }
    alarm(0);
    progress.isDone = true;
}

std::string WordsOfEnd(int status) {
    if (WIFSIGNALED(status)) return std::string("ended by: ") + strsignal(WTERMSIG(status));
    return "ended with exit code " + std::to_string(WEXITSTATUS(status));
}

void KeepInput(const Options& options, uint64_t seed) {
    const std::string name = "fuzz-failure-" + std::to_string(seed);
    const std::vector<uint8_t> input = MakeInput(seed, options);
    std::ofstream file(name, std::ios::binary);
    file.write(reinterpret_cast<const char*>(input.data()), static_cast<std::streamsize>(input.size()));
    if (file.flush())
        std::fprintf(stderr, "the input is kept in %s\n", name.c_str());
    else
        std::fprintf(stderr, "the input could not be kept in %s\n", name.c_str());
}

void TellFailure(const Options& options, const Progress& progress, int status) {
    std::fprintf(stderr, "after %llu runs: %s\n", static_cast<unsigned long long>(progress.runs),
                 WordsOfEnd(status).c_str());
    if (progress.isDone) {
        std::fprintf(stderr, "all runs came to their end; the failure is of the whole session\n");
        return;
    }
    const std::string family = options.family ? " --family " + std::string(options.family->Name()) : "";
    std::fprintf(stderr, "again with: pixelkiln_fuzz --runs 1 --seed %llu%s --verbose\n",
                 static_cast<unsigned long long>(progress.seed), family.c_str());
    KeepInput(options, progress.seed);
}

int RunSession(const Options& options) {
    void* shared = mmap(nullptr, sizeof(Progress), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
    if (shared == MAP_FAILED) {
        std::perror("mmap");
        return 1;
    }
    Progress& progress = *new (shared) Progress{};
    std::printf("first seed %llu\n", static_cast<unsigned long long>(options.seed));
    std::fflush(stdout);

    const pid_t child = fork();
    if (child == 0) {
        RunSeeds(options, progress);
        std::exit(0); // not _exit: leaks are found on the way out
    }
    int status = 0;
    if (child < 0 || waitpid(child, &status, 0) != child) {
        std::perror("child process");
        return 1;
    }
    if (WIFEXITED(status) && WEXITSTATUS(status) == 0) {
        std::printf("%llu runs, no failure\n", static_cast<unsigned long long>(progress.runs));
        return 0;
    }
    TellFailure(options, progress, status);
    return 1;
}

int RunFiles(const std::vector<std::string>& names) {
    for (const std::string& name : names) {
        std::ifstream file(name, std::ios::binary);
        if (!file) {
            std::fprintf(stderr, "cannot read %s\n", name.c_str());
            return 2;
        }
        const std::vector<char> bytes{std::istreambuf_iterator<char>(file), {}};
        LLVMFuzzerTestOneInput(reinterpret_cast<const uint8_t*>(bytes.data()), bytes.size());
        std::printf("%s: no failure\n", name.c_str());
    }
    return 0;
}

} // namespace

int main(int count, char** arguments) {
    const Options options = Parse(count, arguments);
    return options.files.empty() ? RunSession(options) : RunFiles(options.files);
}
