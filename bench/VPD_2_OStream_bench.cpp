// Writing a large VPD document: one machine whose "Partitions" list holds
// 1,000 resources of 20 properties each.

#include "transform/VPD_2_OStream.h"
#include "vpd/ResourceList.h"

#include <benchmark/benchmark.h>

#include <cstdint>
#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>
#include <unistd.h>

namespace {

constexpr int gc_NumberOf_Resources = 1000;
constexpr int gc_NumberOf_Properties = 20;
constexpr const char* gc_Keywords[gc_NumberOf_Properties] = {
    "EC", "FN", "MN", "PN", "SE", "SN", "TM", "AD", "AP", "AS",
    "AX", "BC", "HN", "LO", "OS", "PT", "SZ", "VD", "YL", "Z_"};

Quorvex::VPD::ResourceSet u_largeSet() {
    Quorvex::VPD::Resource machine("1234-ABC-10ABCDE", "1234-ABC-10ABCDE");
    for (int r = 0; r < gc_NumberOf_Resources; ++r) {
        std::string const id = "1234-ABC-10ABCDE-" + std::to_string(r);
        Quorvex::VPD::Resource partition("host" + std::to_string(r), id);
        for (const char* keyword : gc_Keywords) {
            partition.insert_Property(Quorvex::VPD::Property(keyword, id + "-" + keyword));
        }
        machine.insert_Resource("Partitions", partition);
    }
    Quorvex::VPD::ResourceSet set("com.zor.inventory.Hardware", "Hardware", "1.0", "1700000000000");
    set.set_Resource(machine);
    return set;
}

std::string u_benchFileName() {
    return "/tmp/quorvex_vpd_bench_" + std::to_string(::getpid()) + ".xml";
}

void BM_WriteLargeDocumentToFile(benchmark::State& state) {
    Quorvex::VPD::ResourceSet const set = u_largeSet();
    std::string const path = u_benchFileName();
    std::streamoff bytes = 0;
    for (auto _ : state) {
        std::ofstream file(path, std::ios::out | std::ios::trunc);
        Transform::VPD_2_OStream{file}(set);
        file.flush();
        bytes = file.tellp();
    }
    std::remove(path.c_str());
    state.SetBytesProcessed(state.iterations() * bytes);
    state.counters["document_bytes"] = static_cast<double>(bytes);
}
BENCHMARK(BM_WriteLargeDocumentToFile)->Unit(benchmark::kMillisecond);

// The same document into memory: what the flush at every line break costs.
void BM_WriteLargeDocumentToMemory(benchmark::State& state) {
    Quorvex::VPD::ResourceSet const set = u_largeSet();
    std::size_t bytes = 0;
    for (auto _ : state) {
        std::ostringstream out;
        Transform::VPD_2_OStream{out}(set);
        bytes = out.str().size();
        benchmark::DoNotOptimize(bytes);
    }
    state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(bytes));
}
BENCHMARK(BM_WriteLargeDocumentToMemory)->Unit(benchmark::kMillisecond);

} // namespace
