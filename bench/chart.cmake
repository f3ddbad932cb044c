nd_bench(chart SOURCES ChartBench.cpp LIBS nd_chart nd_resources)
target_compile_definitions(bench_chart PRIVATE ND_APP_DIR="${ND_APP_DIR}")
