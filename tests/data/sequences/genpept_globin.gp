LOCUS       MYG_PROGU                153 aa            linear   MAM 01-NOV-1990
DEFINITION  Myoglobin.
ACCESSION   P02170
VERSION     P02170.2
DBSOURCE    UniProtKB: locus MYG_PROGU, accession P02170;
            class: standard.
KEYWORDS    Heme; Iron; Metal-binding; Muscle protein; Oxygen transport;
            Transport.
SOURCE      Procavia capensis (Cape rock hyrax)
  ORGANISM  Procavia capensis
            Eukaryota; Metazoa; Chordata; Craniata; Vertebrata; Euteleostomi;
            Mammalia; Eutheria; Afrotheria; Hyracoidea; Procaviidae;
            Procavia.
REFERENCE   1  (residues 1 to 153)
  AUTHORS   Romero-Herrera,A.E., Lehmann,H., Joysey,K.A. and Friday,A.E.
  TITLE     On the evolution of myoglobin
  JOURNAL   Philos. Trans. R. Soc. Lond., B, Biol. Sci. 283 (995), 61-163
            (1978)
  MEDLINE   78221372
   PUBMED   27799
COMMENT     [FUNCTION] Serves as a reserve supply of oxygen and facilitates
            the movement of oxygen within muscles.
FEATURES             Location/Qualifiers
     source          1..153
                     /organism="Procavia capensis"
                     /db_xref="taxon:9813"
     Protein         1..153
                     /product="Myoglobin"
     Region          2..148
                     /region_name="Globin"
                     /note="Globin; pfam00042"
ORIGIN      
        1 glsdgewqlv lnvwgkvegd lsghgqevli rlfkghpetl ekfdkfkhlk aedemrasee
       61 lkkhgttvlt alggilkkkg qhaaelapla qshatkhkip vkylefisea iiqvlqskhp
      121 gdfgadaqga mskalelfrn diaakykelg fqg
//
