// Variable-length integer coding and Archive throughput.
#include <benchmark/benchmark.h>

#include <random>
#include <vector>

#include "zoUtils/archive.h"
#include "zoUtils/input_archive.h"
#include "zoUtils/variable_length.h"

namespace {

using namespace norv;

// Values with a spread of encoded lengths (1 to 5 bytes).
std::vector<std::uint32_t> MixedValues() {
  std::mt19937 rng(1);
  std::vector<std::uint32_t> v(4096);
  for (auto& x : v) x = rng() >> (rng() % 32);
  return v;
}

class NullStream : public IOutputStream {
 public:
  void WriteStream(const void*, ssize_t size) override {
    bytes += static_cast<std::uint64_t>(size);
  }
  void FlushStream() override {}
  std::uint64_t bytes = 0;
};

void BM_VarintEncode(benchmark::State& state) {
  const auto values = MixedValues();
  std::vector<std::uint8_t> buf(values.size() * 5);
  for (auto _ : state) {
    std::uint8_t* p = buf.data();
    for (std::uint32_t v : values) p = SerialiseVariableLengthUint32(p, v);
    benchmark::DoNotOptimize(p);
  }
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(values.size()));
}
BENCHMARK(BM_VarintEncode);

void BM_VarintDecodeBounded(benchmark::State& state) {
  const auto values = MixedValues();
  std::vector<std::uint8_t> buf(values.size() * 5);
  std::uint8_t* end = buf.data();
  for (std::uint32_t v : values) end = SerialiseVariableLengthUint32(end, v);
  for (auto _ : state) {
    InputArchive in(buf.data(), static_cast<std::size_t>(end - buf.data()));
    std::uint32_t sum = 0;
    while (!in.AtEnd()) sum += in.ReadVarUint32();
    benchmark::DoNotOptimize(sum);
  }
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(values.size()));
}
BENCHMARK(BM_VarintDecodeBounded);

void BM_ArchiveWriteVarints(benchmark::State& state) {
  const auto values = MixedValues();
  NullStream out;
  for (auto _ : state) {
    Archive ar(&out);
    for (std::uint32_t v : values) {
      std::uint8_t* p = ar.Reserve(kMaxVariableLengthUint32Bytes);
      ar.Advance(static_cast<std::size_t>(SerialiseVariableLengthUint32(p, v) - p));
    }
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(out.bytes));
}
BENCHMARK(BM_ArchiveWriteVarints);

void BM_ArchiveWriteBytes(benchmark::State& state) {
  const std::vector<std::uint8_t> chunk(static_cast<std::size_t>(state.range(0)), 0x5A);
  NullStream out;
  for (auto _ : state) {
    Archive ar(&out);
    for (int i = 0; i < 256; ++i) ar.WriteBytes(chunk.data(), chunk.size());
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(out.bytes));
}
BENCHMARK(BM_ArchiveWriteBytes)->Arg(16)->Arg(100)->Arg(1024)->Arg(8192);

}  // namespace

BENCHMARK_MAIN();
