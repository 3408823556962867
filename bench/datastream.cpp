// The data stream and the XML data form beside their floors, on one data source of 20 variables
// of 500,000 rows (10 M varied doubles, some strings), in the same run:
//   GetDataStream   vs zlib compress2 of the same raw layout at the same level   (limit 1.1x)
//   ReadStreamData  vs zlib uncompress of the stream plus one copy of the raw bytes (limit 1.2x)
//   XML write/read  vs std::to_chars / std::from_chars of the same values          (limit 2x)
// and the memory each stream direction needs beyond the store and the compressed bytes.
#include <plotaid/VarDataProcessor.h>
#include <plotaid/XmlDataHandler.h>

#include "data/XmlDataForm.h"

#include <zpack/zpack.h>

#include "BenchSupport.h"

#include <benchmark/benchmark.h>
#include <zlib.h>

#include <algorithm>
#include <charconv>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <memory>
#include <random>
#include <string>
#include <vector>

namespace {

constexpr unsigned kVariables = 20;
constexpr unsigned kRows = 500000;
const std::string kSource = "sales";

VarDataProcessor& store() {
    static VarDataProcessor* s = [] {
        auto* store = new VarDataProcessor;
        store->AddDataSource(kSource, kRows);
        std::mt19937_64 rng(2026);
        std::vector<double> column(kRows);
        for (unsigned v = 0; v < kVariables; ++v) {
            for (unsigned r = 0; r < kRows; ++r) {
                switch (v % 5) {
                case 0: // counts
                    column[r] = static_cast<double>(rng() % 1000);
                    break;
                case 1: // prices
                    column[r] = static_cast<double>(rng() % 10000000) / 100.0;
                    break;
                case 2: // measurements of full precision
                    column[r] = std::uniform_real_distribution<double>(-1e4, 1e4)(rng);
                    break;
                case 3: // ratios
                    column[r] = std::uniform_real_distribution<double>(0, 1)(rng);
                    break;
                default: // large values with gaps
                    column[r] = rng() % 50 == 0 ? -1.7976931348623157e308
                                                : std::normal_distribution<double>(1e7, 3e6)(rng);
                }
            }
            char name[16];
            std::snprintf(name, sizeof name, "var%02u", v);
            store->SetVariableValueRange(kSource, name, column.data(), 0, kRows);
        }
        for (unsigned r = 0; r < kRows; r += 50)
            store->SetStringVariableValue(kSource, "var00", r, "group " + std::to_string(rng() % 40));
        return store;
    }();
    return *s;
}

struct Bytes {
    std::unique_ptr<unsigned char[]> data;
    unsigned length = 0;
};

const Bytes& stream() {
    static const Bytes s = [] {
        Bytes b;
        b.data.reset(store().GetDataStream(b.length));
        return b;
    }();
    return s;
}

const std::string& rawLayout() {
    static const std::string raw = [] {
        std::string out;
        zpack::decompressString(
            out, std::string(reinterpret_cast<const char*>(stream().data.get()), stream().length));
        return out;
    }();
    return raw;
}

const std::string& xmlText() {
    static const std::string xml = [] {
        std::string out;
        plotaid::detail::writeXmlData(store(), out);
        return out;
    }();
    return xml;
}

// The values as the XML holds them, without any of its markup: the from_chars floor reads these.
const std::string& valueText() {
    static const std::string text = [] {
        std::string out;
        const std::string& xml = xmlText();
        for (std::size_t at = xml.find("<row>"); at != std::string::npos; at = xml.find("<row>", at + 5)) {
            const std::size_t end = xml.find('<', at + 5);
            out.append(xml, at + 5, end - at - 5);
            out += ';';
        }
        return out;
    }();
    return text;
}

void GetDataStream(benchmark::State& state) {
    for (auto _ : state) {
        unsigned length = 0;
        std::unique_ptr<unsigned char[]> s(store().GetDataStream(length));
        if (!s)
            state.SkipWithError("GetDataStream failed");
        benchmark::DoNotOptimize(s.get());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * rawLayout().size()));
}

void zlibCompress2(benchmark::State& state) {
    const std::string& raw = rawLayout();
    for (auto _ : state) {
        uLongf size = compressBound(raw.size());
        std::unique_ptr<Bytef[]> out(new Bytef[size]);
        if (compress2(out.get(), &size, reinterpret_cast<const Bytef*>(raw.data()), raw.size(),
                      Z_DEFAULT_COMPRESSION) != Z_OK)
            state.SkipWithError("compress2 failed");
        benchmark::DoNotOptimize(out.get());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * rawLayout().size()));
}

void ReadStreamData(benchmark::State& state) {
    for (auto _ : state) {
        VarDataProcessor back;
        if (!back.ReadStreamData(stream().data.get(), stream().length))
            state.SkipWithError("ReadStreamData failed");
        benchmark::DoNotOptimize(&back);
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * rawLayout().size()));
}

void zlibUncompressAndCopy(benchmark::State& state) {
    const std::size_t rawSize = rawLayout().size();
    for (auto _ : state) {
        std::unique_ptr<Bytef[]> out(new Bytef[rawSize]);
        std::unique_ptr<Bytef[]> copy(new Bytef[rawSize]);
        uLongf size = rawSize;
        if (uncompress(out.get(), &size, stream().data.get(), stream().length) != Z_OK || size != rawSize)
            state.SkipWithError("uncompress failed");
        std::memcpy(copy.get(), out.get(), rawSize);
        benchmark::DoNotOptimize(copy.get());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * rawLayout().size()));
}

void writeXmlData(benchmark::State& state) {
    for (auto _ : state) {
        std::string out;
        plotaid::detail::writeXmlData(store(), out);
        benchmark::DoNotOptimize(out.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * xmlText().size()));
}

void toCharsFloor(benchmark::State& state) {
    VarDataProcessor& s = store();
    std::vector<const double*> columns;
    for (unsigned v = 0; v < kVariables; ++v) {
        char name[16];
        std::snprintf(name, sizeof name, "var%02u", v);
        columns.push_back(s.GetDataPointer(kSource, name));
    }
    for (auto _ : state) {
        std::string out;
        out.reserve(xmlText().size());
        char buf[32];
        for (unsigned r = 0; r < kRows; ++r) {
            for (const double* c : columns) {
                const auto res = std::to_chars(buf, buf + sizeof buf, c[r], std::chars_format::general, 16);
                out.append(buf, res.ptr);
                out += ';';
            }
        }
        benchmark::DoNotOptimize(out.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * xmlText().size()));
}

void readXmlData(benchmark::State& state) {
    for (auto _ : state) {
        VarDataProcessor back;
        if (!plotaid::detail::readXmlData(back, xmlText()))
            state.SkipWithError("readXmlData failed");
        benchmark::DoNotOptimize(&back);
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * xmlText().size()));
}

void fromCharsFloor(benchmark::State& state) {
    const std::string& text = valueText();
    for (auto _ : state) {
        std::vector<double> cells(std::size_t(kRows) * kVariables);
        std::size_t n = 0;
        const char* p = text.data();
        const char* const end = p + text.size();
        while (p < end && n < cells.size()) {
            const auto r = std::from_chars(p, end, cells[n++]);
            p = static_cast<const char*>(std::memchr(r.ptr, ';', end - r.ptr));
            if (!p)
                break;
            ++p;
        }
        benchmark::DoNotOptimize(cells.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * xmlText().size()));
}

// The whole host-facing conversions, stream and zlib included: reported, not limited.
void BuildXmlData(benchmark::State& state) {
    for (auto _ : state) {
        XmlDataHandler handler(stream().data.get(), stream().length);
        std::string out;
        if (!handler.GetXmlData(out, false))
            state.SkipWithError("GetXmlData failed");
        benchmark::DoNotOptimize(out.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * xmlText().size()));
}

void BuildDataStream(benchmark::State& state) {
    for (auto _ : state) {
        XmlDataHandler handler(xmlText());
        unsigned length = 0;
        std::unique_ptr<unsigned char[]> s(handler.GetDataStream(length));
        if (!s)
            state.SkipWithError("GetDataStream failed");
        benchmark::DoNotOptimize(s.get());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * xmlText().size()));
}

BENCHMARK(zlibCompress2)->Unit(benchmark::kMillisecond)->Iterations(1)->Repetitions(3);
BENCHMARK(GetDataStream)->Unit(benchmark::kMillisecond)->Iterations(1)->Repetitions(3);
BENCHMARK(zlibUncompressAndCopy)->Unit(benchmark::kMillisecond)->Repetitions(5);
BENCHMARK(ReadStreamData)->Unit(benchmark::kMillisecond)->Repetitions(5);
BENCHMARK(toCharsFloor)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(writeXmlData)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(fromCharsFloor)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(readXmlData)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(BuildXmlData)->Unit(benchmark::kMillisecond)->Iterations(1)->Repetitions(2);
BENCHMARK(BuildDataStream)->Unit(benchmark::kMillisecond)->Iterations(1)->Repetitions(2);

long statusKb(const char* field) {
    std::ifstream in("/proc/self/status");
    std::string line;
    while (std::getline(in, line))
        if (line.rfind(field, 0) == 0)
            return std::atol(line.c_str() + std::strlen(field));
    return -1;
}

// Peak resident memory of one operation beyond what it keeps: the high-water mark is reset to the
// current size first, so earlier peaks do not count.
template <typename Op> long peakBeyondKb(Op op, long keptKb) {
    const long before = statusKb("VmRSS:");
    {
        std::ofstream reset("/proc/self/clear_refs");
        reset << "5";
    }
    op();
    return statusKb("VmHWM:") - before - keptKb;
}

void reportMemory() {
    const Bytes& s = stream();
    const double rawMb = static_cast<double>(rawLayout().size()) / 1e6;
    std::printf("raw layout %.1f MB, stream %.1f MB (%.0f%%), XML %.1f MB\n", rawMb, s.length / 1e6,
                100.0 * s.length / rawLayout().size(), xmlText().size() / 1e6);
    long written = 0;
    const long writeExtra = peakBeyondKb(
        [&] {
            unsigned length = 0;
            std::unique_ptr<unsigned char[]> out(store().GetDataStream(length));
            written = static_cast<long>(length);
        },
        0);
    // The new stream array is what the operation hands back.
    const long writeBeyond = writeExtra - written / 1024;
    VarDataProcessor back;
    const long capacityKb =
        static_cast<long>(std::uint64_t(store().GetCapacity(kSource)) * 8 * kVariables / 1024);
    const long readBeyond = peakBeyondKb([&] { back.ReadStreamData(s.data.get(), s.length); }, capacityKb);
    std::printf("peak memory beyond store and stream: GetDataStream %.1f MB (%.1f%% of raw), "
                "ReadStreamData %.1f MB (%.1f%% of raw); limit 10%%\n",
                writeBeyond / 1024.0, 100.0 * writeBeyond * 1024 / rawLayout().size(), readBeyond / 1024.0,
                100.0 * readBeyond * 1024 / rawLayout().size());
}

} // namespace

int main(int argc, char** argv) {
    if (!bench::initialize(argc, argv))
        return 1;
    reportMemory();
    bench::BestTimes times;
    benchmark::RunSpecifiedBenchmarks(&times);
    benchmark::Shutdown();

    const double raw = static_cast<double>(rawLayout().size()) / 1e6;
    const double xml = static_cast<double>(xmlText().size()) / 1e6;
    bool ok = bench::within(times, "GetDataStream", "zlibCompress2", 1.1, raw);
    ok = bench::within(times, "ReadStreamData", "zlibUncompressAndCopy", 1.2, raw) && ok;
    ok = bench::within(times, "writeXmlData", "toCharsFloor", 2.0, xml) && ok;
    ok = bench::within(times, "readXmlData", "fromCharsFloor", 2.0, xml) && ok;
    // The whole host-facing conversions include the stream's deflate or inflate: reported only.
    bench::within(times, "BuildXmlData", "toCharsFloor", 0, xml);
    bench::within(times, "BuildDataStream", "fromCharsFloor", 0, xml);
    return ok ? 0 : 1;
}
