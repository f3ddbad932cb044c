# A maximised chart's frame handed from its render thread to the interface thread and converted
# to colour there.
nd_bench(hand_over SOURCES HandOverBench.cpp LIBS nd_platform_qt nd_resources Qt6::Widgets)
