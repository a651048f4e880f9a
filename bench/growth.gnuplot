# The cost of a start-up over the number of files on the device. Reads the file growth.
set terminal dumb size 79,32
set multiplot layout 2,1
set logscale xy
set format xy "%.0s%c"
set key left top
do for [which=0:1] {
    set title which ? "system calls" : "instructions"
    set yrange [(which ? 10 : 1e5):(which ? 1e4 : 1e9)]
    plot "growth" using 1:(column(6 + which)) with linespoints title "ICU files, no schema in them", \
         "" using 1:(column(4 + which)) with linespoints title "files below an icutz directory", \
         "" using 1:(column(2 + which)) with linespoints title "stored data sets"
}
unset multiplot
