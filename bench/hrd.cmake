# The H-R diagram: sets dropped on it, a chart's selection plotted, hovering over a full
# diagram, clearing it.
nd_bench(hrd SOURCES HRDBench.cpp LIBS nd_hrd Qt6::Widgets)
