# The list window: sets dropped on its pads, with the list hidden and shown, and a list of
# 100,000 names built and painted.
nd_bench(lists SOURCES ListBench.cpp LIBS nd_lists Qt6::Widgets)
