# The importer's grouping of stars into systems.
nd_bench(grouping SOURCES GroupingBench.cpp LIBS nd_importer)
