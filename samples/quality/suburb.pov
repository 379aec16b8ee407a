// Brick and plaster houses with lawns and trees along a road.
#declare FogDistance = 160;
#include "common.inc"

camera { perspective location <0, 5, 0> right x * 4 / 3 up y angle 58 look_at <3, 4, 60> }
Sun(<0.5, 0.7, -0.4>, <0.94, 0.90, 0.80>)
SkyLight(<0.18, 0.21, 0.26>)
Sky(<0.80, 0.86, 0.90>, <0.36, 0.58, 0.86>, <0.96, 0.96, 0.97>)

plane { y, 0
  texture {
    pigment { bozo turbulence 0.9 colour_map { [0 rgb <0.16, 0.26, 0.08>] [1 rgb <0.30, 0.38, 0.14>] } scale 2 }
    finish { Matt } normal { bumps 0.8 scale 0.2 }
  }
}
box { <-4, 0, -10>, <2, 0.02, 600> Rough(<0.30, 0.30, 0.31>, 1) }

// On both sides in turn a house with three windows, and three trees in front of it.
#declare Walls = array[4] { <0.50, 0.20, 0.14>, <0.78, 0.74, 0.66>, <0.62, 0.46, 0.26>, <0.40, 0.44, 0.48> }
#declare R = seed(77);
#declare I = 0;
#while (I < 26)
  #declare Side = 2 * mod(I, 2) - 1;
  #declare Z = 16 + 11 * I;
  #declare X = Side * (11 + 4 * rand(R));
  box { <X - 4, 0, Z>, <X + 4, 5, Z + 8> Rough(Walls[floor(rand(R) * 3.99)], 1) }
  prism {
    linear_sweep linear_spline 0, 8.6, 4, <-4.4, 0>, <4.4, 0>, <0, 3.4>, <-4.4, 0>
    rotate -90 * x translate <X, 5, Z + 8.3>
    Rough(<0.28, 0.12, 0.09> * (0.7 + 0.6 * rand(R)), 1)
  }
  #declare K = 0;
  #while (K < 3)
    box { <X - 3 + 2.4 * K, 1.4, Z - 0.05>, <X - 1.8 + 2.4 * K, 3, Z + 0.1> Rough(<0.03, 0.04, 0.05>, 1) }
    #declare K = K + 1;
  #end
  #declare T = 0;
  #while (T < 3)
    #declare TX = Side * (5 + 3 * rand(R));
    #declare TZ = Z + 10 * rand(R);
    #declare S = 2 + 3 * rand(R);
    cylinder { <TX, 0, TZ>, <TX, S, TZ>, 0.15 Rough(<0.16, 0.11, 0.08>, 0.4) }
    #declare K = 0;
    #while (K < 10)
      sphere { <TX + (rand(R) - 0.5) * S * 0.7, S * (0.8 + 0.5 * rand(R)), TZ + (rand(R) - 0.5) * S * 0.7>, S * 0.2
        Rough(<0.10, 0.20, 0.05> * (0.7 + 0.8 * rand(R)), 0.4) }
      #declare K = K + 1;
    #end
    #declare T = T + 1;
  #end
  #declare I = I + 1;
#end
