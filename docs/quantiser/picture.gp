# SPDX-License-Identifier: MIT
# The picture of docs/quantiser.md: gnuplot docs/quantiser/picture.gp, in the root of the project.
set terminal svg size 1100,640 font "sans-serif,12" background rgb "white"
set output "docs/pictures/quantiser.svg"
set datafile separator ","
set multiplot layout 2,3
set logscale xy
set xrange [0.9:17.5]
set yrange [1e-5:1]
set xtics (1, 2, 3, 4, 5, 6, 8, 12, 16)
set format y "10^{%T}"
set xlabel "factor"
set ylabel "block error rate"
set grid
set key bottom left
do for [rate in "1e-2 1e-4"] {
    if (rate eq "1e-4") { unset key }
    do for [K in "40 1024 6144"] {
        set title "K = " . K
        plot for [type = 0:2] "docs/quantiser/rate_" . rate . ".csv" \
            using ($1 == K + 0 && $3 == type && $12 > 0 ? $6 : NaN):14:17:18 \
            with yerrorlines pointtype 7 pointsize 0.5 linetype type + 1 title "type " . type
    }
}
