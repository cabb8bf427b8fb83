# Draws the times that bench/report.py measured. Usage: gnuplot -e "data='FILE'; picture='FILE'" bench/plot.gp
set terminal svg size 760,460 font "sans-serif,13" background "white"
set output picture
set datafile missing "-"
set title "Processor time of a request, leases, logging off"
set xlabel "records in the table"
set ylabel "seconds"
set logscale xy
set format x "10^{%T}"
set format y "10^{%T}"
set grid
set key outside right
requests = "Load EnumInstances EnumInstanceNames ModifyInstance GetInstance AssociatorNames"
plot for [i=1:words(requests)] data using 1:(column(2*i)) with linespoints lc i lw 2 pt 7 ps 0.5 title word(requests, i), \
     for [i=1:words(requests)] data using 1:(column(2*i+1)) with lines lc i dt 2 title "baseline"
