// A park with a bright path, people, trees and houses behind.
#declare FogDistance = 120;
#include "common.inc"

camera { perspective location <0, 1.7, 0> right x * 4 / 3 up y angle 56 look_at <2, 3, 40> }
Sun(<-0.5, 0.7, -0.3>, <0.95, 0.88, 0.76>)
SkyLight(<0.20, 0.23, 0.28>)
Sky(<0.80, 0.86, 0.90>, <0.35, 0.57, 0.86>, <0.96, 0.96, 0.97>)

plane { y, 0
  texture {
    pigment {
      bozo turbulence 0.9
      colour_map { [0 rgb <0.24, 0.42, 0.12>] [0.6 rgb <0.36, 0.52, 0.18>] [1 rgb <0.48, 0.52, 0.26>] }
      scale 1.5
    }
    finish { Matt } normal { bumps 0.8 scale 0.2 }
  }
}
prism { linear_spline 0, 0.03, 5, <-2, -5>, <1.5, -5>, <9, 120>, <7, 120>, <-2, -5> Rough(<0.66, 0.60, 0.50>, 0.6) }

// Trees beside the path.
#declare R = seed(12);
#declare I = 0;
#while (I < 90)
  #declare Z = 10 + 300 * pow(rand(R), 1.4);
  #declare X = (rand(R) - 0.5) * (30 + 1.5 * Z);
  #if (abs(X - Z * 0.06) > 3)
    #declare S = 4 + 5 * rand(R);
    #declare C = <0.22 + 0.35 * rand(R) * rand(R), 0.34, 0.10>;
    cylinder { <X, 0, Z>, <X, S, Z>, 0.25 Rough(<0.28, 0.22, 0.16>, 0.4) }
    #declare K = 0;
    #while (K < 14)
      sphere { <X + (rand(R) - 0.5) * S * 0.7, S * (0.7 + 0.5 * rand(R)), Z + (rand(R) - 0.5) * S * 0.7>, S * 0.17
        Rough(C, 0.5) }
      #declare K = K + 1;
    #end
  #end
  #declare I = I + 1;
#end

// People on it.
#declare I = 0;
#while (I < 16)
  #declare Z = 8 + 60 * rand(R);
  #declare X = Z * 0.06 + (rand(R) - 0.5) * 6;
  cylinder { <X, 0, Z>, <X, 1.35, Z>, 0.22 Rough(<rand(R), rand(R), rand(R)> * 0.8, 1) }
  sphere { <X, 1.55, Z>, 0.15 Rough(<0.72, 0.52, 0.40>, 1) }
  #declare I = I + 1;
#end

#declare I = 0;
#while (I < 9)
  box { <-220 + 50 * I, 0, 300>, <-185 + 50 * I, 12 + 30 * rand(R), 320> Rough(<0.70, 0.64, 0.56>, 3) }
  #declare I = I + 1;
#end
