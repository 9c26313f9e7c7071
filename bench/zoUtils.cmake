norv_add_bench(NAME zoUtils_bench SOURCES zoUtils_bench.cc DEPS zoUtils)
