# SPDX-License-Identifier: MIT
# The pictures of docs/atlas.md: gnuplot docs/atlas/pictures.gp, in the root of the project.
set logscale x
set xlabel "K"
set grid
set linetype 1 linecolor rgb "#0072b2"
set linetype 2 linecolor rgb "#d55e00"
set linetype 3 linecolor rgb "#009e73"

# K and Eb/N0 of a type after so many iterations.
thresholds(type, iterations, rate) = sprintf("< awk -F, '$3 == %d && $4 == %d && $7 == %s { print $1, $8 }' \
    docs/atlas/thresholds.csv", type, iterations, rate)
set terminal svg size 1100,640 font "sans-serif,12" background rgb "white"
set output "docs/pictures/atlas.svg"
set multiplot layout 2,3
set xrange [38:6500]
set xtics (40, 80, 160, 320, 640, 1280, 2560, 6144)
set ylabel "Eb/N0 [dB]"
do for [rate in "0.1 0.01"] {
    set yrange [rate eq "0.1" ? 0.2 : 0.4:rate eq "0.1" ? 2 : 2.8]
    do for [type = 0:2] {
        set title sprintf("type %d: %g %% of blocks fail", type, 100 * rate)
        plot for [i = 1:3] thresholds(type, 2 + 2 * i, rate) \
            with lines linetype i linewidth 1.5 title sprintf("%d iterations", 2 + 2 * i)
    }
}
unset multiplot

# K and what a type needs with so many units beyond what it needs with 2.
loss(units, type) = sprintf("< awk -F, '$3 == %d && $4 == 8 && $7 == 0.1 { \
    if ($2 == 2) base[$1] = $8; if ($2 == %s) print $1, $8 - base[$1] }' docs/atlas/units.csv", type, units)
set terminal svg size 1100,360 font "sans-serif,12" background rgb "white"
set output "docs/pictures/atlas_units.svg"
set multiplot layout 1,2
set xrange [700:6500]
set xtics (768, 1024, 1536, 2048, 3072, 4096, 6144)
set yrange [-0.02:0.08]
set ylabel "loss [dB]"
set key top left
do for [units in "4 8"] {
    set title sprintf("%s units: 10 %% of blocks fail, 8 iterations", units)
    plot for [type = 0:2] loss(units, type) \
        with linespoints linetype type + 1 pointtype 7 pointsize 0.5 title sprintf("type %d", type)
}
