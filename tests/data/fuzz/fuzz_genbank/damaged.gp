LOCUS       A   6 aa   linear
DEFINITION  first.
ORIGIN
        1 mkvlaa
//
LOCUS
ORIGIN
        1 ww
//
LOCUS       NOSEQ   6 aa
DEFINITION  no origin.
        1 mkvlaa
//
LOCUS       B   4 bp
ORIGIN
 1 acgt
//
LOCUS       C   8 aa
ORIGIN
        1 mkvl

       5 wwgg
LOCUS       D   3 aa
ORIGIN
 1 mkw