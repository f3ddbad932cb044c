nd_bench(chart SOURCES ChartBench.cpp LimitKernel.cpp LIBS nd_chart nd_resources)
target_compile_definitions(bench_chart PRIVATE ND_APP_DIR="${ND_APP_DIR}")
# The limit is built like the star pass it is held against (chart/CMakeLists.txt).
set_source_files_properties(LimitKernel.cpp PROPERTIES COMPILE_OPTIONS "-O3;-ffp-contract=off")
