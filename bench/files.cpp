// Splitting paths and querying the disk, beside std::filesystem and the bare system call. Results are
// compared with the library's before a row is timed.
#include <benchmark/benchmark.h>
#include <dirent.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "basalt/files.h"

namespace {

namespace fs = std::filesystem;
using vex_util::CFilePath;
using vex_util::Path;

constexpr char NARROW_PATH[] = "/home/survey/data/2026/site-17/job.tar.gz";
constexpr wchar_t WIDE_PATH[] = L"/home/survey/data/2026/site-17/job.tar.gz";

// A folder with files, one of them the path of the rows.
class Folder {
public:
    static constexpr int FILES = 200;

    Folder() : m_root(fs::temp_directory_path() / ("basalt_bench_files_" + std::to_string(getpid()))) {
        fs::create_directories(m_root / "site-17");
        for (int i = 0; i < FILES; ++i) {
            std::ofstream(m_root / "site-17" / ("job" + std::to_string(i) + ".txt"));
        }
    }
    ~Folder() { fs::remove_all(m_root); }
    Folder(const Folder&) = delete;
    Folder& operator=(const Folder&) = delete;

    std::string file() const { return (m_root / "site-17" / "job100.txt").string(); }

private:
    fs::path m_root;
};

CString wide(const std::string& text) {
    return text.c_str();
}

bool equal(const CString& a, const fs::path& b) {
    return a == wide(b.string());
}

void split_basalt(benchmark::State& state) {
    const CString text = WIDE_PATH;
    for ([[maybe_unused]] auto _ : state) {
        const Path path(text);
        benchmark::DoNotOptimize(&path);
        benchmark::ClobberMemory();
    }
}
BENCHMARK(split_basalt)->Name("path_split/basalt");

struct StandardParts {
    fs::path root, parent, stem, extension;

    explicit StandardParts(const fs::path& path)
        : root(path.root_name()),
          parent(path.parent_path()),
          stem(path.stem()),
          extension(path.extension()) {}
};

void split_std_filesystem(benchmark::State& state) {
    const Path path(WIDE_PATH);
    const StandardParts parts{fs::path(NARROW_PATH)};
    if (!equal(path.GetPath(1), parts.root) || !equal(path.GetPath(2), parts.parent / "") ||
        !equal(path.GetPath(4), parts.stem) || !equal(path.GetPath(8), parts.extension)) {
        state.SkipWithError("results differ");
    }
    const std::string text = NARROW_PATH;
    for ([[maybe_unused]] auto _ : state) {
        const StandardParts split{fs::path(text)};
        benchmark::DoNotOptimize(&split);
        benchmark::ClobberMemory();
    }
}
BENCHMARK(split_std_filesystem)->Name("path_split/std_filesystem");

void select_basalt(benchmark::State& state) {
    const Path path(WIDE_PATH);
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(&path.GetPath(12));
    }
}
BENCHMARK(select_basalt)->Name("path_select/basalt");

void select_std_filesystem(benchmark::State& state) {
    const fs::path path(NARROW_PATH);
    if (!equal(Path(WIDE_PATH).GetPath(12), path.filename())) {
        state.SkipWithError("results differ");
    }
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(path.filename());
    }
}
BENCHMARK(select_std_filesystem)->Name("path_select/std_filesystem");

void set_basalt(benchmark::State& state) {
    const Folder folder;
    CString text = wide(folder.file());
    CFilePath path;
    for ([[maybe_unused]] auto _ : state) {
        path = text;
        benchmark::DoNotOptimize(&path);
    }
}
BENCHMARK(set_basalt)->Name("path_set/basalt");

void set_one_stat(benchmark::State& state) {
    const Folder folder;
    const std::string file = folder.file();
    struct stat status {};
    const bool is_directory = stat(file.c_str(), &status) != 0 || S_ISDIR(status.st_mode);
    if (is_directory != CFilePath(wide(file)).IsDirectory()) {
        state.SkipWithError("results differ");
    }
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(stat(file.c_str(), &status));
    }
}
BENCHMARK(set_one_stat)->Name("path_set/limit_one_stat");

void set_std_filesystem(benchmark::State& state) {
    const Folder folder;
    const std::string file = folder.file();
    const CFilePath path(wide(file));
    const StandardParts parts{fs::path(file)};
    if (!equal(path.FileNameOnly(), parts.stem) ||
        !equal(path.Extension(), parts.extension.string().substr(1))) {
        state.SkipWithError("results differ");
    }
    for ([[maybe_unused]] auto _ : state) {
        const fs::path whole(file);
        const StandardParts split(whole);
        benchmark::DoNotOptimize(fs::is_directory(whole));
        benchmark::DoNotOptimize(&split);
    }
}
BENCHMARK(set_std_filesystem)->Name("path_set/std_filesystem");

// Full paths, in the text type of a program that uses std::filesystem.
std::vector<std::string> list_by_std_filesystem(const std::string& file) {
    std::vector<std::string> files;
    for (const fs::directory_entry& entry : fs::directory_iterator(fs::path(file).parent_path())) {
        files.push_back(entry.path().native());
    }
    return files;
}

void list_basalt(benchmark::State& state) {
    const Folder folder;
    CFilePath path(wide(folder.file()));
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(path.GetFilesInDirectory(L"*"));
    }
}
BENCHMARK(list_basalt)->Name("list_200_files/basalt")->Unit(benchmark::kMicrosecond);

// The names as the system returns them, not kept.
void list_limit(benchmark::State& state) {
    const Folder folder;
    const std::string path = fs::path(folder.file()).parent_path();
    for ([[maybe_unused]] auto _ : state) {
        DIR* const names = opendir(path.c_str());
        while (const dirent* const entry = readdir(names)) {
            benchmark::DoNotOptimize(entry->d_name);
        }
        closedir(names);
    }
}
BENCHMARK(list_limit)->Name("list_200_files/limit_reading_the_folder")->Unit(benchmark::kMicrosecond);

void list_std_filesystem(benchmark::State& state) {
    const Folder folder;
    const std::string file = folder.file();
    CFilePath path(wide(file));
    std::vector<CString> ours = path.GetFilesInDirectory(L"*");
    for (CString& name : ours) {
        name = name.Mid(path.Directory().GetLength() + 1);
    }
    std::vector<CString> theirs = {L".", L".."};
    for (const std::string& found : list_by_std_filesystem(file)) {
        theirs.push_back(wide(fs::path(found).filename().string()));
    }
    std::sort(ours.begin(), ours.end());
    std::sort(theirs.begin(), theirs.end());
    if (ours != theirs) {
        state.SkipWithError("results differ");
    }
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(list_by_std_filesystem(file));
    }
}
BENCHMARK(list_std_filesystem)->Name("list_200_files/std_filesystem")->Unit(benchmark::kMicrosecond);

}  // namespace

BENCHMARK_MAIN();
