LOCUS       A  3 aa
COMMENT     @QRBO-DATA@ 07FF
ORIGIN
 1 mkv
//
