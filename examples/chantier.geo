        Option_Correc                       1  -6.4  -2.4  601250.000  2428760.000  152.000  6366.000
        Option_Projec                       Projection Lambert Zone II
        Option_Nivell                       1  0  0.015
        Option_Planim                       1  0.005  0.010  0.020  0.015  0.050 0.020 2
000001  Commentaire      Lotissement « Les Prés Hauts » — état des lieux du 14 mars 2023
000002  Commentaire      Opérateurs : M. Lefèvre, A. Durand — temps couvert, 9 °C, 1012 hPa
000003  Appareil         0.001200 0.000000 0.000300 0.000300 0.002000 2.0 Tachéomètre TS 06 n° 4417
000004  Point            S1               3  601234.512000 2428765.331000   151.874000 borne***OGE
000005  Point            S2               0  601404.571000 2428836.180000 -999999.000000 calculé
000006  Point            S3               3  601319.484000 2428962.936000   153.518000 borne***OGE
000007  Point            S4               0  601259.484000 2429038.296000 -999999.000000 calculé
000008  Point            R100             1  601890.000000 2429012.500000 -999999.000000 clocher
000009  Point            NGF12            2 -999999.000000 -999999.000000   150.412000 repère***NGF
000010  Commentaire      Station S1, orientation sur le clocher de l'église Saint-Martin
000011  Station          S1                1.562000   0.0000000                    
000012  Reference        R100                       53.5878430                    
000013  Reference        S2                1.300000  51.4123610  99.6960954 184.138299 clou
000014  Mesure           101               1.300000 201.2201000 100.4150000  35.412000 angle***bâti
000015  ExcentRad                         0.1500
000016  Mesure           102               1.300000 231.7712000 101.0022000  41.118000 arbre
000017  ExcentTan                        -0.2500
000018  Mesure           103               2.000000 260.1045000  98.4400000  22.905000 regard***EU
000019  ExcentVer                         0.0500
000020  Mesure           104               1.300000 288.9020000 100.8810000  30.777000 poteau***béton
000021  Commande         Calcul rayonnement S1
000022  Station          S2                1.548000  -1.0000000                    
000023  Reference        S1                1.300000 156.6466610 100.4842255 184.138285 clou
000024  Reference        S3                1.300000 244.1408098  99.8978945 152.589872 clou
000025  Mesure           105               1.300000  45.1180000 100.0210000  28.450000 bordure
000026  Mesure           106               1.300000  60.9033000  99.9870000  33.120000 bordure
000027  Station          S3                1.601000  -1.0000000                    
000028  Reference        S2                1.300000 260.5860098 100.3348797 152.589367 clou
000029  Reference        S1                1.300000 324.0744083 100.5780614 215.001800 clou
000030  Reference        S4                1.300000  55.4146844 100.3804932  96.278936 piquet
000031  Mesure           107               1.300000 380.2211000 101.2044000  18.905000 avaloir
000032  Station          S4                1.577000  -1.0000000                    
000033  Reference        S3                1.300000  80.1907844 100.0049249  96.280827 clou
000034  Mesure           108               1.300000 150.4409000 100.3310000  24.118000 arbre
000035  Mesure           109               1.300000 171.0050000 100.9902000  31.604000 haie
000036  CheminEncadre    C1               S1-1 S2-1 S3-1
000037  CheminAntenne    C2               S3-1 S4-1
000038  Commentaire      Nivellement direct du repère NGF12 sur S1 puis S2
000039  NivLectAR        NGF12             1.654300  35.200000 repère***NGF
000040  NivLectAV        S1                0.192300  36.050000 borne
000041  NivLectAR        S1                1.512000  38.100000 
000042  NivLectAV        S2                0.365200  37.950000 borne
000043  Commentaire      Fin du levé à 16 h 40
