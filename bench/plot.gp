# Draws the times per record of bench/report.py: gnuplot -e "data='FILE'; picture='FILE'" bench/plot.gp
set terminal svg size 760,460 font "sans-serif,13" background "white"
set output picture
set datafile missing "-"
set title "Processor time per record, leases, logging off"
set xlabel "records in the table"
set ylabel "nanoseconds per record"
set logscale xy
set format x "10^{%T}"
set format y "10^{%T}"
set grid
set key outside right
requests = "Load EnumInstances EnumInstanceNames GetInstance.middle ModifyInstance"
plot for [i=1:words(requests)] data using 1:(column(2*i)) with linespoints lc i lw 2 pt 7 ps 0.5 title word(requests, i), \
     for [i=1:words(requests)] data using 1:(column(2*i+1)) with lines lc i dt 2 title "baseline"
