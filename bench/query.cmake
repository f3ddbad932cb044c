nd_bench(query SOURCES QueryBench.cpp LIBS nd_query)
# Sets written as CSV and read back, by name and by position, over a million systems.
nd_bench(set_csv SOURCES SetCsvBench.cpp LIBS nd_query)
# Pressing each query panel's drag handle, up to the drag starting: the query and the drag.
nd_bench(query_panels SOURCES FindBench.cpp LIBS nd_query_panels Qt6::Widgets)
