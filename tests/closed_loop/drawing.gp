# The amount of the error over the time since the start, of all ways. Wants: points, drawing (paths).
set terminal svg size 900,420 font "sans-serif,13" background "white"
set output drawing
set logscale y
set format y "10^{%T}"
set xrange [0:210]
set yrange [0.3:100000]
set xlabel "seconds since the start"
set ylabel "observed error, us"
set grid y
set key outside top center horizontal
set object 1 rectangle from 105, graph 0 to 165, graph 1 fillcolor "#e8e8e8" fillstyle solid noborder behind
set arrow 1 from 190, graph 0 to 190, graph 1 nohead dashtype 2 linecolor "#808080"
set label 1 "no grandmaster" at 135, graph 0.95 center
set label 2 "kill" at 191, graph 0.95
way(name) = sprintf("< awk '$1 == \"%s\" && $2 != \"free\"' %s", name, points)
plot way("ntp") using 3:(abs($4)) with lines linecolor "#999999" title "NTP client", \
     way("servo") using 3:(abs($4)) with lines linecolor "#d95f02" title "ptp4l's own servo", \
     way("pairs") using 3:(abs($4)) with lines linewidth 2 linecolor "#1f78b4" title "vantel-host and chronyd"
