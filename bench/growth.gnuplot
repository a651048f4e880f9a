# The cost of a start-up over the number of things on the device. Reads growth/*.
set multiplot layout 2,1
set logscale xy
set format xy "%.0s%c"
set key left top
do for [column in "instructions calls"] {
    set title column eq "calls" ? "system calls" : "instructions"
    set yrange [(column eq "calls" ? 10 : 1e5):(column eq "calls" ? 1e4 : 1e9)]
    plot "growth/folder" using "number":column with linespoints title "files in icutz", \
         "growth/below" using "number":column with linespoints title "files below icutz", \
         "growth/sets" using "number":column with linespoints title "stored data sets"
}
unset multiplot
