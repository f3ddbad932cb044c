nd_bench(query SOURCES QueryBench.cpp LIBS nd_query)
