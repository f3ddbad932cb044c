# Render benchmarks: the additive raster kernels.
nd_bench(raster SOURCES RasterBench.cpp LIBS nd_render nd_resources)
